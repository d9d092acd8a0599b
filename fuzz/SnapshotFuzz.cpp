#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <nlohmann/json.hpp>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "fuzz/DisplayChecks.h"
#include "fuzz/MemoryFile.h"
#include "fuzz/MessageRules.h"
#include "fuzz/Require.h"
#include "host/Printable.h"
#include "model/VarnelModelNode.h"
#include "programs/shared/SnapshotFile.h"
#include "programs/varnel-decode/GenerationWriters.h"
#include "programs/varnel-decode/PlotRecorder.h"
#include "programs/varnel-decode/TechnologyGuess.h"

using namespace varnel;

namespace {

constexpr std::size_t watchedPaths = 3;

bool isOneLine(const std::string& text) { return !text.empty() && text.find('\n') == std::string::npos; }

bool isSnapshot(const std::optional<Value>& list) {
  return list && list->dictionary() && list->dictionary()->get("Data").array();
}

bool isStoredDisplay(const Value& item) { return item.dictionary() && item.dictionary()->has("Display"); }

bool isBinaryLog(const Value& item) { return item.dictionary() && item.dictionary()->get("DLF").data(); }

// The output of one of the program's writers, as a text.
class Output {
 public:
  Output() : _file(open_memstream(&_text, &_size)) { require(_file, "there is a stream in memory"); }
  Output(const Output&) = delete;
  Output& operator=(const Output&) = delete;
  ~Output() {
    std::fclose(_file);
    std::free(_text);
  }

  std::FILE* file() const { return _file; }
  std::string_view text() const { return {_text, _size}; }

 private:
  char* _text = nullptr;
  std::size_t _size = 0;
  std::FILE* _file;
};

// Takes one field of the CSV text and the character that ends it, a comma or a newline.
std::string takeField(std::string_view& table, char end) {
  std::string field;
  const bool isQuoted = table.starts_with('"');
  if (isQuoted) table.remove_prefix(1);
  while (!table.empty() && (isQuoted || table[0] != end)) {
    const bool isQuote = isQuoted && table[0] == '"';
    if (isQuote && !table.starts_with("\"\"")) break;
    field += table[0];
    table.remove_prefix(isQuote ? 2 : 1);
  }
  if (isQuoted) {
    require(table.starts_with('"'), "a quoted field has an end");
    table.remove_prefix(1);
  }
  require(table.starts_with(end), "a table has its columns");
  table.remove_prefix(1);
  return field;
}

// The paths of the first leaves, in the order of the tree.
void addLeafPaths(std::vector<std::string>& paths, const VarnelModelNode& node, const std::string& path) {
  if (paths.size() >= watchedPaths) return;
  if (!node.childNodes()) return paths.push_back(path);
  for (const auto& child : *node.childNodes())
    addLeafPaths(paths, *child, childPath(path, child->displayName()));
}

void checkEveryDisplay(const std::vector<Generation>& generations, ValuesAs valuesAs) {
  Output output;
  const NumberFormats formats;
  EveryDisplay sink(output.file(), std::nullopt, {valuesAs, Displays::All}, formats);
  for (const Generation& generation : generations) sink.take(generation);
  std::string_view lines = output.text();
  for (std::size_t count = generations.size(); count > 0; --count) {
    const std::size_t length = lines.find('\n');
    require(length != std::string_view::npos && nlohmann::json::accept(lines.substr(0, length)),
            "each display is one line of JSON");
    lines.remove_prefix(length + 1);
  }
  require(lines.empty(), "there are no more lines than displays");
}

void checkValueTable(const std::vector<Generation>& generations, const std::vector<std::string>& paths) {
  Output output;
  const NumberFormats formats;
  ValueTable sink(output.file(), paths, std::nullopt, {}, formats);
  for (const Generation& generation : generations) sink.take(generation);
  std::string_view table = output.text();
  for (const Generation& generation : generations) {
    PathDictionary nodes;
    static_cast<void>(VarnelModelNode::makeTreeFromObject_withPathDictionary(generation.display, nodes));
    takeField(table, ',');
    for (const std::string& path : paths) {
      const auto node = nodes.find(path);
      const std::string* value = node == nodes.end() ? nullptr : node->second->value();
      const std::string field = takeField(table, &path == &paths.back() ? '\n' : ',');
      require(field == (value ? printable(*value, "\t\r\n") : ""),
              "a table holds the values under its paths");
    }
  }
  require(table.empty(), "a table has a row a display");
}

void checkPlot(const std::vector<Generation>& generations, const std::vector<std::string>& paths) {
  PlotRecorder recorder(paths);
  const TechnologyGuess guess;  // a snapshot needs none
  SeenPaths seen(paths, guess);
  for (const Generation& generation : generations) {
    recorder.take(generation);
    seen.take(generation);
  }
  const Plot plot = recorder.plot("from outside");
  require(plot.series.empty() == recorder.isEmpty(), "a plot without numbers has no series");
  require(plot.series.size() + seen.unseen().size() <= paths.size(), "what has no value has no series");
  for (const PlotSeries& series : plot.series) {
    require(!series.points.empty() && series.points.size() <= 2 * PlotLine::mostColumns,
            "a series has two points a column at the most");
    for (const PlotPoint& point : series.points)
      require(std::isfinite(point.seconds) && std::isfinite(point.lowest) && std::isfinite(point.highest),
              "points can be drawn");
  }
}

void checkGenerations(const SnapshotFile& snapshot) {
  std::vector<Generation> generations;
  try {
    generations = snapshot.generations();
  } catch (const std::runtime_error& error) {
    require(isOneLine(error.what()), "an error is one line");
    return;
  }
  const Array& items = *snapshot.items().array();
  require(std::ranges::count_if(items, isStoredDisplay) == static_cast<std::ptrdiff_t>(generations.size()),
          "every stored display is shown");
  if (generations.empty()) return;
  std::vector<std::string> paths;
  PathDictionary nodes;
  const Value& display = generations.front().display;
  addLeafPaths(paths, *VarnelModelNode::makeTreeFromObject_withPathDictionary(display, nodes), "/");
  for (const ValuesAs valuesAs : {ValuesAs::Texts, ValuesAs::Numbers})
    checkEveryDisplay(generations, valuesAs);
  if (paths.empty()) return;
  checkValueTable(generations, paths);
  checkPlot(generations, paths);
}

void checkShown(const SnapshotFile& snapshot) {
  const Value shown = snapshot.shown();
  const Array& items = *shown.dictionary()->get("Data").array();
  require(items.size() == snapshot.items().array()->size(), "every item is shown");
  for (const Value& item : items) {
    require(!item.dictionary() || !(item.dictionary()->has("DLF") || item.dictionary()->has("DisplayState")),
            "neither raw messages nor the binary log are shown");
  }
  checkTree(shown);
  checkFormats(shown);
}

void checkBinaryLog(const SnapshotFile& snapshot) {
  const Array& items = *snapshot.items().array();
  const auto found = std::ranges::find_if(items, isBinaryLog);
  const Bytes* log = binaryLogOf(snapshot.items());
  require((log != nullptr) == (found != items.end()), "a binary log that is there is found");
  require(!log || *log == *found->dictionary()->get("DLF").data(), "the first binary log is taken out");
}

}  // namespace

// The input is a snapshot that the user names. It is told from captures by how it begins, and is either
// refused with one line or shown in every format.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static MemoryFile file;
  const ByteView bytes(data, size);
  if (isLaborious(bytes, fileLimits)) return 0;
  file.set(bytes);
  const std::string path = file.path();
  ByteWindow window(openFile(path, AtEndOfFile::Stop));
  const bool isList = SnapshotFile::isPropertyList(window);
  require(!isList || data[0] == '<' || data[0] == 'b', "a snapshot begins as lists do");
  std::optional<SnapshotFile> snapshot;
  try {
    snapshot.emplace(window, path);
  } catch (const std::runtime_error& error) {
    require(isOneLine(error.what()), "an error is one line");
  }
  require(snapshot.has_value() == isSnapshot(readPropertyList(bytes, fileLimits)),
          "exactly the lists with an array Data are snapshots");
  if (!snapshot) return 0;
  checkShown(*snapshot);
  checkGenerations(*snapshot);
  checkBinaryLog(*snapshot);
  return 0;
}
