#include "programs/varnel-decode/PlotRecorder.h"

#include <algorithm>
#include <charconv>
#include <chrono>
#include <clocale>
#include <cmath>
#include <utility>

#include "base/ClockStep.h"
#include "host/Printable.h"
#include "model/VarnelModelNode.h"
#include "programs/shared/Modules.h"
#include "programs/varnel-decode/GenerationWriters.h"
#include "programs/varnel-decode/plot/ChartModule.h"

namespace varnel {

namespace {

// The years 1 to 9999. An axis can show no other years.
constexpr double earliest = -62135596800, latest = 253402300799;

bool isDigit(char character) { return character >= '0' && character <= '9'; }

bool belongsToUnit(char character) {
  return character == '%' || character == '/' || (character >= 'A' && character <= 'Z') ||
         (character >= 'a' && character <= 'z');
}

std::string unitIn(std::string_view rest) {
  constexpr std::size_t longestUnit = 8;
  rest.remove_prefix(std::min(rest.find_first_not_of(' '), rest.size()));
  const bool isUnit = !rest.empty() && rest.size() <= longestUnit && rest.front() != '/' &&
                      std::ranges::all_of(rest, belongsToUnit);
  return isUnit ? std::string(rest) : std::string();
}

std::optional<Measurement> hexadecimalIn(std::string_view digits) {
  std::uint64_t number = 0;
  const char* const end = digits.data() + digits.size();
  const auto [rest, failure] = std::from_chars(digits.data(), end, number, 16);
  if (failure != std::errc()) return std::nullopt;
  return Measurement{static_cast<double>(number), unitIn({rest, end})};
}

double secondsSinceEpoch(Time time) {
  const double seconds = static_cast<double>(time.seconds) + time.nanoseconds * 1e-9;
  return std::clamp(seconds, earliest, latest);
}

// A text for the picture. A longer text is cut, but never inside a character of UTF-8.
std::string shortened(std::string_view text) {
  constexpr std::size_t mostCharacters = 200;
  std::size_t characters = 0, size = 0;
  for (; size < text.size(); ++size) {
    const bool isContinuation = (static_cast<unsigned char>(text[size]) & 0xC0) == 0x80;
    if (!isContinuation && ++characters > mostCharacters) break;
  }
  // A text of continuation bytes only would have no characters.
  size = std::min(size, 4 * mostCharacters);
  return printable(text.substr(0, size)) + (size < text.size() ? "…" : "");
}

// The path of the section or list that all of several paths have in common; empty for a single path.
std::string_view commonSection(const std::vector<std::string_view>& paths) {
  if (paths.size() < 2) return {};
  std::string_view common = paths.front();
  for (const std::string_view path : paths)
    common = common.substr(0, std::ranges::mismatch(common, path).in1 - common.begin());
  // A cut inside a name or inside a selection is not allowed.
  std::size_t end = 0, open = 0;
  for (std::size_t i = 0; i < common.size(); ++i) {
    if (open == 0 && (common[i] == '/' || common[i] == '[')) end = i;
    if (common[i] == '[') ++open;
    if (common[i] == ']' && open > 0) --open;
  }
  return common.substr(0, end);
}

Time timeAt(double seconds) {
  const double whole = std::floor(seconds);
  return {static_cast<std::int64_t>(whole), static_cast<std::int32_t>((seconds - whole) * 1e9)};
}

bool isClockSetBetween(double earlier, double later) {
  const ClockStep step = clockStep(timeAt(earlier), timeAt(later));
  return step == ClockStep::Back || step == ClockStep::Ahead;
}

}  // namespace

std::optional<Measurement> measurementIn(std::string_view text) {
  text.remove_prefix(std::min(text.find_first_not_of(' '), text.size()));
  if (text.starts_with("0x") || text.starts_with("0X")) return hexadecimalIn(text.substr(2));
  if (text.starts_with('+') && text.size() > 1 && text[1] != '-') text.remove_prefix(1);
  // Without this check, "inf" and "nan" would be numbers.
  const std::size_t first = text.starts_with('-') ? 1 : 0;
  if (first >= text.size() || (!isDigit(text[first]) && text[first] != '.')) return std::nullopt;
  double number = 0;
  const char* const end = text.data() + text.size();
  const auto [rest, failure] = std::from_chars(text.data(), end, number, std::chars_format::fixed);
  if (failure != std::errc()) return std::nullopt;
  return Measurement{number, unitIn({rest, end})};
}

void PlotLine::Column::take(const Column& later) {
  until = std::max(until, later.until);
  lowest = std::min(lowest, later.lowest);
  highest = std::max(highest, later.highest);
  sum += later.sum;
  count += later.count;
}

void PlotLine::add(double seconds, double value) {
  const bool isClockSet = !_columns.empty() && isClockSetBetween(_latest, seconds);
  const auto number = static_cast<std::int64_t>(std::floor((seconds - earliest) / _width));
  const bool isSameColumn = !_columns.empty() && !isClockSet && number <= _columns.back().number;
  const bool isGap = _isInterrupted && !isSameColumn && !isNextTo(number);
  if (!_columns.empty() && !isClockSet && !isGap)
    _columns.back().until = std::max(_columns.back().until, seconds);
  const Column column{.number = number,
                      .start = seconds,
                      .until = seconds,
                      .lowest = value,
                      .highest = value,
                      .sum = value,
                      .count = 1,
                      .startsNewLine = _columns.empty() || isClockSet || isGap};
  if (isSameColumn) {
    _columns.back().take(column);
  } else {
    _columns.push_back(column);
  }
  _latest = seconds;
  _isInterrupted = false;
  while (_columns.size() > mostColumns) halve();
}

void PlotLine::interrupt(double seconds) {
  if (!_columns.empty() && !_isInterrupted) _columns.back().until = std::max(_columns.back().until, seconds);
  _isInterrupted = true;
}

bool PlotLine::isNextTo(std::int64_t number) const {
  return !_columns.empty() && number == _columns.back().number + 1;
}

void PlotLine::halve() {
  for (Column column : std::exchange(_columns, {})) {
    column.number /= 2;
    if (!_columns.empty() && _columns.back().number == column.number) {
      _columns.back().take(column);
      continue;
    }
    if (isNextTo(column.number)) {
      column.startsNewLine = false;
      _columns.back().until = column.start;
    }
    _columns.push_back(column);
  }
  _width *= 2;
}

std::vector<PlotPoint> PlotLine::points() const {
  std::vector<PlotPoint> points;
  for (const Column& column : _columns) {
    // Because of rounding, the mean of equal values can differ from them.
    const double mean =
        std::clamp(column.sum / static_cast<double>(column.count), column.lowest, column.highest);
    points.push_back({column.start, column.until, column.lowest, mean, column.highest, column.startsNewLine});
  }
  return points;
}

PlotRecorder::PlotRecorder(const std::vector<std::string>& paths) {
  for (const std::string& path : paths)
    _series.push_back({.path = treePath(path), .unit = {}, .otherText = {}, .line = {}});
}

double PlotRecorder::secondsOf(const Generation& generation) {
  const double elapsed = std::chrono::duration<double>(generation.elapsed).count();
  const bool isDated = generation.dating == Dating::Known;
  if (!_times) {
    _times = isDated ? PlotTimes::SinceEpoch : PlotTimes::SinceFirstRecord;
    if (isDated) _first = secondsSinceEpoch(generation.time) - elapsed;
  }
  const bool isOnClock = isDated && *_times == PlotTimes::SinceEpoch;
  return isOnClock ? secondsSinceEpoch(generation.time) : _first + elapsed;
}

void PlotRecorder::take(const Generation& generation) {
  const double seconds = secondsOf(generation);
  for (Series& series : _series) {
    const auto text = leafValueUnderPath(generation.display, series.path);
    const auto measurement = text ? measurementIn(*text) : std::nullopt;
    if (!measurement) {
      if (text && !series.otherText) series.otherText = *text;
      series.line.interrupt(seconds);
      continue;
    }
    if (!series.unit) series.unit = measurement->unit;
    series.line.add(seconds, measurement->number);
  }
}

bool PlotRecorder::isEmpty() const {
  return std::ranges::all_of(_series, [](const Series& series) { return series.line.isEmpty(); });
}

std::vector<PlotRecorder::Unplotted> PlotRecorder::unplotted() const {
  std::vector<Unplotted> unplotted;
  for (const Series& series : _series)
    if (series.line.isEmpty() && series.otherText)
      unplotted.push_back({series.path.substr(1), shortened(*series.otherText)});
  return unplotted;
}

Plot PlotRecorder::plot(const std::string& title) const {
  std::vector<std::string_view> labels;
  for (const Series& series : _series)
    if (!series.line.isEmpty()) labels.push_back(std::string_view(series.path).substr(1));
  const std::string_view section = commonSection(labels);
  Plot plot{shortened(title + (section.empty() ? "" : ": " + std::string(section))),
            {},
            _times.value_or(PlotTimes::SinceEpoch)};
  for (const Series& series : _series) {
    if (series.line.isEmpty()) continue;
    std::string label = series.path.substr(1 + section.size());
    if (!section.empty() && label.starts_with('/')) label.erase(0, 1);
    plot.series.push_back({shortened(label), series.unit.value_or(""), series.line.points()});
  }
  return plot;
}

std::string drawPlot(const Plot& plot) {
  const auto draw = reinterpret_cast<decltype(&varnelDrawPlot)>(
      moduleFunction("varnel-decode-plot.so", "varnelDrawPlot", "draws pictures"));
  std::string svg;
  draw(plot, svg);
  // The toolkit sets the user's locale; property lists need "C".
  std::setlocale(LC_NUMERIC, "C");
  return svg;
}

}  // namespace varnel
