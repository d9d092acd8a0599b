#include "widgets/RememberedSize.h"

#include <charconv>
#include <string>
#include <string_view>
#include <system_error>
#include <utility>

#include "base/Log.h"
#include "host/WholeFile.h"
#include "widgets/FirstSize.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;

constexpr const char* fileName = "window-size";
constexpr int largestSide = 32767;  // the largest window side in X11

// Takes a number from the front of the text; nothing when the text does not begin with a possible side of a
// window.
std::optional<int> takeSide(std::string_view& text) {
  int side = 0;
  const auto [end, failure] = std::from_chars(text.data(), text.data() + text.size(), side);
  if (failure != std::errc() || side < smallestWindowSide || side > largestSide) return std::nullopt;
  text.remove_prefix(static_cast<std::size_t>(end - text.data()));
  return side;
}

std::optional<QSize> sizeIn(std::string_view text) {
  const auto width = takeSide(text);
  if (!width || !text.starts_with(' ')) return std::nullopt;
  text.remove_prefix(1);
  const auto height = takeSide(text);
  return height && text == "\n" ? std::optional(QSize(*width, *height)) : std::nullopt;
}

void makeFolder(const fs::path& folder, std::error_code& failure) {
  if (fs::create_directories(folder, failure)) fs::permissions(folder, fs::perms::owner_all, failure);
}

// What went wrong; nothing when the text is on the disk.
std::optional<std::string> write(const fs::path& file, const std::string& text) {
  std::error_code failure;
  makeFolder(file.parent_path(), failure);
  if (failure) return failure.message();
  failure = writeWholeFile(file, Bytes(text.begin(), text.end()));
  return failure ? std::optional(failure.message()) : std::nullopt;
}

}  // namespace

RememberedSize::RememberedSize(std::optional<fs::path> folder) {
  if (folder) _file = *folder / fileName;
}

std::optional<QSize> RememberedSize::size() const {
  const auto bytes = _file ? readWholeFile(*_file) : std::nullopt;
  if (!bytes) return std::nullopt;
  return sizeIn({reinterpret_cast<const char*>(bytes->data()), bytes->size()});
}

void RememberedSize::keep(const QSize& size) const {
  if (!_file) return;
  const std::string text = std::to_string(size.width()) + " " + std::to_string(size.height()) + "\n";
  if (const auto failure = write(*_file, text))
    logWarning("Unable to keep the window's size in %s: %s", _file->string(), *failure);
}

}  // namespace varnel
