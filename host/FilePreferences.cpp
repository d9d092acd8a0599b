#include "host/FilePreferences.h"

#include <optional>
#include <utility>

#include "base/Log.h"
#include "base/PropertyList.h"
#include "host/SessionBus.h"
#include "host/WholeFile.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;

constexpr std::string_view preferencesFolder = "var/mobile/Library/Preferences";
constexpr const char* busObject = "/com/orvane/Preferences";
constexpr const char* busInterface = "com.orvane.Preferences";
constexpr const char* changedSignal = "Changed";

// The existing list, or an empty one when there is no file; nothing when the file holds something else.
std::optional<Value> listAt(const fs::path& path) {
  std::error_code failure;
  if (fs::status(path, failure).type() == fs::file_type::not_found) return Value::ofDictionary();
  const auto bytes = readWholeFile(path);
  auto list = bytes ? readPropertyList(*bytes, fileLimits) : std::nullopt;
  return list && list->dictionary() ? list : std::nullopt;
}

// What went wrong; nothing when the list is on the disk.
std::optional<std::string> writeList(const fs::path& path, const Value& list) {
  const auto bytes = writeXmlPropertyList(list);
  if (!bytes) return "it has no property-list form";
  std::error_code failure;
  fs::create_directories(path.parent_path(), failure);
  if (failure) return failure.message();
  failure = writeWholeFile(path, *bytes, ReplacedMode::Kept);
  return failure ? std::optional(failure.message()) : std::nullopt;
}

}  // namespace

void FilePreferences::set(std::string_view domain, std::string_view key, Value value) {
  _unwritten[std::string(domain)].set(key, std::move(value));
}

void FilePreferences::synchronise(std::string_view domain) {
  const auto found = _unwritten.find(domain);
  if (found == _unwritten.end()) return;
  const auto changes = std::move(_unwritten.extract(found).mapped());
  const fs::path path = _deviceRoot / preferencesFolder / (std::string(domain) + ".plist");
  const auto list = listAt(path);
  if (!list) {
    logError("Unable to write preferences to %s: what is there is no property list", path.string());
    return;
  }
  for (const auto& [key, value] : changes) list->dictionary()->set(key, value);
  if (const auto failure = writeList(path, *list))
    logError("Unable to write preferences to %s: %s", path.string(), *failure);
}

void FilePreferences::notifyChanged(std::string_view domain, std::string_view key) {
  const auto address = sessionBusAddress();
  if (!address) return;
  const auto text = [](std::string_view part) {
    return QVariant(QString::fromUtf8(part.data(), static_cast<qsizetype>(part.size())));
  };
  const BusSignal signal{busObject, busInterface, changedSignal, {text(domain), text(key)}};
  if (const auto failure = sendBusSignal(*address, signal))
    logError("Unable to announce the change of %s on the session bus: %s", domain, *failure);
}

}  // namespace varnel
