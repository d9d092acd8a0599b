#include "programs/varnel/SavedDisplays.h"

#include <filesystem>
#include <stdexcept>
#include <utility>

#include "LogGenerator/LogGenerator.h"
#include "app/DateFormatter.h"
#include "app/TreeSearch.h"
#include "host/SystemClock.h"
#include "host/captures/ByteSource.h"
#include "host/captures/ByteWindow.h"
#include "model/VarnelModelNode.h"
#include "programs/shared/SnapshotFile.h"

namespace varnel {

namespace {

// How many values of the tree are numbers that have a format.
std::size_t numbersKnownTo(const NumberFormats& formats, const VarnelModelNode& node, NamePath& path) {
  if (!node.childNodes()) {
    const EntryFormats entry = formats.at(path).formats;
    return entry.areKnown() && node.value() && !entry.number(*node.value()).empty() ? 1 : 0;
  }
  std::size_t count = 0;
  for (const auto& child : *node.childNodes()) {
    path.push_back(child->displayName());
    count += numbersKnownTo(formats, *child, path);
    path.pop_back();
  }
  return count;
}

}  // namespace

NumberFormats formatsOfSaved(const Value& display, const Services& services) {
  PathDictionary paths;
  const auto tree = VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
  NumberFormats best;
  std::size_t most = 0;
  for (const std::string_view technology : LogGenerator::technologies()) {
    NumberFormats formats =
        LogGenerator::generatorFromTechnology(std::string(technology), services)->numberFormats();
    NamePath path;
    const std::size_t count = tree ? numbersKnownTo(formats, *tree, path) : 0;
    // All radios come last, and know what a modem of one radio knows.
    if (count <= most) continue;
    most = count;
    best = std::move(formats);
  }
  return best;
}

std::optional<std::vector<Generation>> savedDisplays(const std::string& path) {
  std::error_code failure;
  // What a pipe gives can be read only once.
  if (!std::filesystem::is_regular_file(path, failure)) return std::nullopt;
  ByteWindow bytes(openFile(path, AtEndOfFile::Stop));
  if (!SnapshotFile::isPropertyList(bytes)) return std::nullopt;
  auto displays = SnapshotFile(bytes, captureName(path)).generations();
  if (displays.empty())
    throw std::runtime_error(captureName(path) +
                             " is a snapshot without a display; nothing had arrived when "
                             "it was saved");
  return displays;
}

std::string statusOfSaved(Time time) {
  return DateFormatter("'Display of' yyyy-MM-dd 'at' HH:mm:ss").string(time, SystemClock().zoneAt(time));
}

}  // namespace varnel
