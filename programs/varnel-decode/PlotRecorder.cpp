#include "programs/varnel-decode/PlotRecorder.h"

#include <dlfcn.h>

#include <algorithm>
#include <charconv>
#include <clocale>
#include <cmath>
#include <filesystem>
#include <stdexcept>
#include <utility>

#include "model/VarnelModelNode.h"
#include "programs/varnel-decode/plot/ChartModule.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;

// The years 1 to 9999: others no axis can show.
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

double secondsOf(Time time) {
  const double seconds = static_cast<double>(time.seconds) + time.nanoseconds * 1e-9;
  return std::clamp(seconds, earliest, latest);
}

// Beside the program in the build tree, else where it was installed.
fs::path modulePath() {
  const fs::path folder = fs::read_symlink("/proc/self/exe").parent_path();
  const fs::path beside = folder / "varnel-decode-plot.so";
  return fs::exists(beside) ? beside : folder.parent_path() / "lib/varnel/modules/varnel-decode-plot.so";
}

}  // namespace

std::optional<Measurement> measurementIn(std::string_view text) {
  text.remove_prefix(std::min(text.find_first_not_of(' '), text.size()));
  if (text.starts_with("0x") || text.starts_with("0X")) return hexadecimalIn(text.substr(2));
  if (text.starts_with('+') && text.size() > 1 && text[1] != '-') text.remove_prefix(1);
  // Or else "inf" and "nan" would be numbers.
  const std::size_t first = text.starts_with('-') ? 1 : 0;
  if (first >= text.size() || (!isDigit(text[first]) && text[first] != '.')) return std::nullopt;
  double number = 0;
  const char* const end = text.data() + text.size();
  const auto [rest, failure] = std::from_chars(text.data(), end, number, std::chars_format::fixed);
  if (failure != std::errc()) return std::nullopt;
  return Measurement{number, unitIn({rest, end})};
}

void PlotLine::Column::take(const Point& point) {
  if (point.value < lowest.value) lowest = point;
  if (point.value > highest.value) highest = point;
}

void PlotLine::add(double seconds, double value) {
  if (_columns.empty()) _start = seconds;
  const auto number = static_cast<std::int64_t>(std::floor((seconds - _start) / _width));
  const Point point{seconds, value};
  if (_columns.empty() || number > _columns.back().number) {
    const bool isGapSeen = _isInterrupted && !isNextTo(number);
    _columns.push_back({number, point, point, _columns.empty() || isGapSeen});
  } else {
    addAmongOthers(number, point);
  }
  _isInterrupted = false;
  while (_columns.size() > mostColumns) halve();
}

// Nearly always the last column; an earlier one once the clock was set back.
void PlotLine::addAmongOthers(std::int64_t number, const Point& point) {
  const auto column = std::ranges::lower_bound(_columns, number, {}, &Column::number);
  if (column->number == number) return column->take(point);
  const bool isFirst = column == _columns.begin();
  column->startsNewLine = column->startsNewLine && !isFirst;
  _columns.insert(column, {number, point, point, isFirst});
}

bool PlotLine::isNextTo(std::int64_t number) const {
  return !_columns.empty() && number == _columns.back().number + 1;
}

void PlotLine::halve() {
  for (Column column : std::exchange(_columns, {})) {
    column.number = column.number / 2 - (column.number % 2 < 0 ? 1 : 0);  // rounded down
    if (!_columns.empty() && _columns.back().number == column.number) {
      _columns.back().take(column.lowest);
      _columns.back().take(column.highest);
    } else {
      if (isNextTo(column.number)) column.startsNewLine = false;
      _columns.push_back(column);
    }
  }
  _width *= 2;
}

std::vector<PlotPoint> PlotLine::points() const {
  std::vector<PlotPoint> points;
  for (const auto& [number, lowest, highest, startsNewLine] : _columns) {
    const bool isRising = lowest.seconds <= highest.seconds;
    const Point& first = isRising ? lowest : highest;
    const Point& second = isRising ? highest : lowest;
    points.push_back({first.seconds, first.value, startsNewLine});
    if (second.seconds != first.seconds || second.value != first.value)
      points.push_back({second.seconds, second.value, false});
  }
  return points;
}

PlotRecorder::PlotRecorder(const std::vector<std::string>& paths) {
  for (const std::string& path : paths)
    _series.push_back({.path = treePath(path), .label = treePath(path).substr(1), .unit = {}, .line = {}});
}

void PlotRecorder::take(const Generation& generation) {
  for (Series& series : _series) {
    const auto text = leafValueUnderPath(generation.display, series.path);
    const auto measurement = text ? measurementIn(*text) : std::nullopt;
    if (!measurement) {
      series.line.interrupt();
      continue;
    }
    if (!series.unit) series.unit = measurement->unit;
    series.line.add(secondsOf(generation.time), measurement->number);
  }
}

bool PlotRecorder::isEmpty() const {
  return std::ranges::all_of(_series, [](const Series& series) { return series.line.isEmpty(); });
}

Plot PlotRecorder::plot(const std::string& title) const {
  Plot plot{title, {}};
  for (const Series& series : _series) {
    if (series.line.isEmpty()) continue;
    plot.series.push_back({series.label, series.unit.value_or(""), series.line.points()});
  }
  return plot;
}

std::string drawPlot(const Plot& plot) {
  const fs::path path = modulePath();
  void* const module = ::dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
  if (!module)
    throw std::runtime_error(std::string("cannot load what draws pictures: ") + ::dlerror() +
                             "; build or install it with the program");
  const auto draw = reinterpret_cast<decltype(&varnelDrawPlot)>(::dlsym(module, "varnelDrawPlot"));
  if (!draw) throw std::runtime_error(path.string() + " is none of this program's modules");
  std::string svg;
  draw(plot, svg);
  // The toolkit takes the user's locale; property lists need their own.
  std::setlocale(LC_NUMERIC, "C");
  return svg;  // the module stays: what it has loaded cannot be unloaded
}

}  // namespace varnel
