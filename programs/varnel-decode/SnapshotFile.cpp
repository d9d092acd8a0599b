#include "programs/varnel-decode/SnapshotFile.h"

#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <memory>
#include <stdexcept>
#include <system_error>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "programs/varnel-decode/Timestamps.h"

namespace varnel {

namespace {

constexpr std::string_view itemsKey = "Data";
constexpr std::string_view binaryLogKey = "DLF";
constexpr std::string_view rawMessagesKey = "DisplayState";
constexpr std::string_view displayKey = "Display";
constexpr std::string_view dateKey = "Date";
constexpr std::string_view descriptionKey = "Description";
constexpr std::string_view timestampKey = "Timestamp";

struct CloseFile {
  void operator()(std::FILE* file) const {
    if (file != stdin) std::fclose(file);
  }
};
using File = std::unique_ptr<std::FILE, CloseFile>;

File openFile(const std::string& path) { return File(path == "-" ? stdin : std::fopen(path.c_str(), "rb")); }

[[noreturn]] void failToRead(const std::string& name) {
  throw std::system_error(errno, std::generic_category(), "cannot read " + name);
}

// A little more than a property list may be long, so that a longer one is refused.
Bytes contentsOf(const std::string& path, const std::string& name) {
  const File file = openFile(path);
  if (!file) failToRead(name);
  Bytes bytes;
  std::uint8_t part[1 << 16];
  while (bytes.size() <= fileLimits.size) {
    const std::size_t count = std::fread(part, 1, sizeof part, file.get());
    if (count == 0 && std::ferror(file.get())) failToRead(name);
    if (count == 0) break;
    bytes.insert(bytes.end(), part, part + count);
  }
  return bytes;
}

Value itemAsShown(const Value& item) {
  const Dictionary* entries = item.dictionary();
  if (!entries) return item;
  Value shown = Value::ofDictionary();
  // When it was, then what.
  for (const std::string_view key : {dateKey, descriptionKey})
    shown.dictionary()->set(key, entries->get(key));
  for (const auto& [key, value] : *entries) {
    if (key != binaryLogKey && key != rawMessagesKey) shown.dictionary()->set(key, value);
  }
  return shown;
}

std::optional<Time> timeIn(const Dictionary& entries, std::string_view key) {
  const std::string* text = entries.get(key).string();
  return text ? timeOfDescription(*text) : std::nullopt;
}

}  // namespace

bool SnapshotFile::isPropertyList(const std::string& path) {
  std::error_code ignored;
  if (path != "-" && !std::filesystem::is_regular_file(path, ignored)) return false;
  const File file = openFile(path);
  if (!file) return false;
  const int first = std::getc(file.get());
  std::ungetc(first, file.get());
  // XML and binary; no capture begins like this.
  return first == '<' || first == 'b';
}

SnapshotFile::SnapshotFile(const std::string& path) : _name(path == "-" ? "standard input" : path) {
  auto contents = readPropertyList(contentsOf(path, _name), fileLimits);
  if (!contents)
    throw std::runtime_error(_name +
                             " begins like a snapshot but is no property list; is it cut off or damaged?");
  if (!contents->dictionary() || !contents->dictionary()->get(itemsKey).array())
    throw std::runtime_error(_name + " is a property list but no snapshot, which has an array Data");
  _contents = std::move(*contents);
}

const Value& SnapshotFile::items() const { return _contents.dictionary()->get(itemsKey); }

Value SnapshotFile::shown() const {
  Value shown = _contents.shallowCopy();
  Value shownItems = Value::ofArray();
  for (const Value& item : *items().array()) shownItems.array()->push_back(itemAsShown(item));
  shown.dictionary()->set(itemsKey, std::move(shownItems));
  return shown;
}

std::vector<Generation> SnapshotFile::generations() const {
  const auto saved = timeIn(*_contents.dictionary(), timestampKey);
  std::vector<Generation> generations;
  for (const Value& item : *items().array()) {
    const Dictionary* entries = item.dictionary();
    if (!entries || !entries->has(displayKey)) continue;
    const auto date = timeIn(*entries, dateKey);
    if (!date && !saved)
      throw std::runtime_error(_name + " is damaged: neither a display nor the snapshot has a date");
    generations.push_back({date ? *date : *saved, entries->get(displayKey)});
  }
  return generations;
}

const Bytes* binaryLogOf(const Value& items) {
  const Array* elements = items.array();
  if (!elements) return nullptr;
  for (const Value& item : *elements) {
    const Bytes* log = item.dictionary() ? item.dictionary()->get(binaryLogKey).data() : nullptr;
    if (log) return log;
  }
  return nullptr;
}

}  // namespace varnel
