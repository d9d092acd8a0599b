#include "programs/varnel-decode/GenerationWriters.h"

#include <algorithm>

#include "model/VarnelModelNode.h"
#include "programs/varnel-decode/Printable.h"
#include "programs/varnel-decode/StandardOutput.h"
#include "programs/varnel-decode/Timestamps.h"
#include "programs/varnel-decode/TreeWriters.h"

namespace varnel {

namespace {

std::string csvField(std::string_view value) {
  const std::string text = printable(value, "\t\r\n");
  if (text.find_first_of(",\"\r\n") == std::string::npos) return text;
  std::string quoted = "\"";
  for (const char character : text) {
    if (character == '"') quoted += '"';
    quoted += character;
  }
  return quoted + '"';
}

// Without a date there is none to show, but how long it took to come there.
std::string timeAsJson(const Generation& generation) {
  if (generation.dating == Dating::Known) return jsonString(timestamp(generation.time));
  char elapsed[32];
  std::snprintf(elapsed, sizeof elapsed, "%.3f", std::chrono::duration<double>(generation.elapsed).count());
  return std::string("null,\"Elapsed\":") + elapsed;
}

}  // namespace

std::string treePath(std::string_view path) {
  return path.starts_with('/') ? std::string(path) : '/' + std::string(path);
}

void EveryDisplay::take(const Generation& generation) {
  std::string line = "{";
  if (_captureName) line += "\"Capture\":" + jsonString(*_captureName) + ',';
  line += "\"Time\":" + timeAsJson(generation) + ",\"Display\":";
  writeOutput(_output, line + treeAsJson(generation.display) + "}\n");
}

std::string csvHeader(const std::vector<std::string>& paths, TableColumns columns) {
  std::string line = columns == TableColumns::CaptureTimeAndValues ? "Capture,Time" : "Time";
  for (const std::string& path : paths) line += ',' + csvField(treePath(path).substr(1));
  return line + '\n';
}

ValueTable::ValueTable(std::FILE* output, const std::vector<std::string>& paths,
                       std::optional<std::string> captureName)
    : _output(output), _captureName(std::move(captureName)) {
  std::ranges::transform(paths, std::back_inserter(_paths), treePath);
}

void ValueTable::take(const Generation& generation) {
  std::string line = _captureName ? csvField(*_captureName) + ',' : std::string();
  if (generation.dating == Dating::Known) line += timestamp(generation.time);
  for (const std::string& path : _paths) {
    line += ',';
    if (const auto value = leafValueUnderPath(generation.display, path)) line += csvField(*value);
  }
  writeOutput(_output, line + '\n');
}

void SeenPaths::take(const Generation& generation) {
  std::erase_if(_unseen, [&](const std::string& path) {
    return leafValueUnderPath(generation.display, treePath(path)).has_value();
  });
  if (!_unseen.empty()) _shown.take(generation.display);
}

}  // namespace varnel
