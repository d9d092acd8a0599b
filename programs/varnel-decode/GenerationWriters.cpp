#include "programs/varnel-decode/GenerationWriters.h"

#include <algorithm>

#include "model/VarnelModelNode.h"
#include "programs/shared/CsvField.h"
#include "programs/shared/Timestamps.h"
#include "programs/varnel-decode/ProgramError.h"
#include "programs/varnel-decode/StandardOutput.h"
#include "programs/varnel-decode/TreeWriters.h"

namespace varnel {

namespace {

// Without a date, the time is null, and the elapsed seconds follow.
std::string timeAsJson(const Generation& generation) {
  if (generation.dating == Dating::Known) return jsonString(timestamp(generation.time));
  return "null,\"Elapsed\":" + secondsText(generation.elapsed);
}

}  // namespace

std::string treePath(std::string_view path) {
  return path.starts_with('/') ? std::string(path) : '/' + std::string(path);
}

void EveryDisplay::take(const Generation& generation) {
  const auto members = membersOf(generation.display);
  if (!members) return;
  std::string line = "{";
  if (_captureName) line += "\"Capture\":" + jsonString(*_captureName) + ',';
  line += "\"Time\":" + timeAsJson(generation) + ',';
  writeOutput(_output, line + *members + "}\n");
}

std::optional<std::string> EveryDisplay::membersOf(const Value& display) {
  if (_style.valuesAs == ValuesAs::Texts && _style.displays == Displays::All)
    return "\"Display\":" + treeAsJson(display);
  DisplayJson shown = displayJson(display, _style.valuesAs, _formats);
  if (_style.displays == Displays::All) return wholeMembers(shown);
  if (!_before) return wholeMembers(_before.emplace(std::move(shown)));
  const auto change = mergePatch(_before->display, shown.display);
  const auto changeOfUnits = mergePatch(_before->units, shown.units);
  if (!change && !changeOfUnits) return std::nullopt;
  _before = std::move(shown);
  return "\"Display\":" + (change ? change->text() : "{}") +
         (changeOfUnits ? ",\"Units\":" + changeOfUnits->text() : std::string());
}

std::string EveryDisplay::wholeMembers(const DisplayJson& display) const {
  std::string members = "\"Display\":" + display.display.text();
  if (_style.valuesAs == ValuesAs::Numbers) members += ",\"Units\":" + display.units.text();
  return members;
}

std::string csvHeader(const std::vector<std::string>& paths, TableColumns columns,
                      const NumberFormats& formats) {
  std::string line = columns == TableColumns::CaptureTimeAndValues ? "Capture,Time" : "Time";
  for (const std::string& path : paths) {
    const std::string_view unit = formats.under(path).unit();
    const std::string title = treePath(path).substr(1);
    line += ',' + csvField(unit.empty() ? title : title + " [" + std::string(unit) + ']');
  }
  return line + '\n';
}

ValueTable::ValueTable(std::FILE* output, const std::vector<std::string>& paths,
                       std::optional<std::string> captureName, WritingStyle style,
                       const NumberFormats& formats)
    : _output(output), _captureName(std::move(captureName)), _style(style) {
  for (const std::string& path : paths) _columns.push_back({treePath(path), formats.under(path)});
}

void ValueTable::take(const Generation& generation) {
  _hasEmptyTimes |= generation.dating == Dating::Unknown;
  std::string values;
  for (const Column& column : _columns) values += ',' + csvField(valueIn(column, generation));
  if (_style.displays == Displays::Changed && _before == values) return;
  std::string line = _captureName ? csvField(*_captureName) + ',' : std::string();
  if (generation.dating == Dating::Known) line += timestamp(generation.time);
  writeOutput(_output, line + values + '\n');
  _before = std::move(values);
}

void ValueTable::finish(const std::string& inputName) {
  if (!_hasEmptyTimes || std::ranges::find(_columns, elapsedPath, &Column::path) != _columns.end()) return;
  tell("the modem of " + inputName +
       " knew no date, so rows have no time; the path Elapsed gives the seconds since the first record");
}

std::string ValueTable::valueIn(const Column& column, const Generation& generation) const {
  const auto value = leafValueUnderPath(generation.display, column.path);
  if (!value) return column.path == elapsedPath ? secondsText(generation.elapsed) : std::string();
  if (_style.valuesAs == ValuesAs::Texts) return std::string(*value);
  if (isAbsent(*value)) return {};
  const std::string_view number = column.formats.number(*value);
  return std::string(number.empty() ? *value : number);
}

void SeenPaths::take(const Generation& generation) {
  _isAnyShown = true;
  std::erase_if(_unseen, [&](const std::string& path) {
    return treePath(path) == elapsedPath ||
           leafValueUnderPath(generation.display, treePath(path)).has_value();
  });
  if (!_unseen.empty()) _shown.take(generation.display);
}

// The phone may never have met such a cell. More likely, the name was mistyped.
void SeenPaths::finish(const std::string& inputName) {
  if (!_isAnyShown || _guess.isNeeded()) return;
  for (const std::string& path : _unseen)
    tell("no display of " + inputName + " has a value under '" + path + "'; " + adviceFor(path));
}

std::string SeenPaths::adviceFor(const std::string& path) const {
  return adviceOf(nearestTo(path), "--format paths shows what there is");
}

}  // namespace varnel
