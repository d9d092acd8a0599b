#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "programs/varnel-decode/GenerationWriters.h"
#include "programs/varnel-decode/plot/Plot.h"

namespace varnel {

/// A text that begins with a number, as displays show measurements: "-85 dBm", "12.50 dB", "7", "0x1F".
struct Measurement {
  double number;
  std::string unit;  ///< what follows the number when it looks like a unit; else empty
};
/// Nothing for a text that does not begin with a number; blanks before it count for nothing.
std::optional<Measurement> measurementIn(std::string_view text);

/// Values over time, thinned out as they come in: never more than two for each of a thousand columns of the
/// picture, its lowest and its highest; gaps that are narrower than a column close. Short sequences are kept
/// whole.
class PlotLine {
 public:
  static constexpr std::size_t mostColumns = 1000;

  /// Times are those of displays. They come in order until the clock is set back; then each value still goes
  /// where its time is. Seconds since 1970.
  void add(double seconds, double value);
  /// There is no value at this time: no line crosses it.
  void interrupt() { _isInterrupted = true; }

  bool isEmpty() const { return _columns.empty(); }
  std::vector<PlotPoint> points() const;

 private:
  struct Point {
    double seconds, value;
  };
  struct Column {
    std::int64_t number;
    Point lowest, highest;
    bool startsNewLine;

    void take(const Point& point);
  };

  void addAmongOthers(std::int64_t number, const Point& point);
  void halve();
  bool isNextTo(std::int64_t number) const;

  std::vector<Column> _columns;
  double _start = 0;           // of the column 0, in which the first value lies
  double _width = 1.0 / 1024;  // of each, in seconds; doubled whenever there are too many
  bool _isInterrupted = false;
};

/// Gathers the numbers under some paths for a picture.
class PlotRecorder final : public GenerationSink {
 public:
  explicit PlotRecorder(const std::vector<std::string>& paths);
  void take(const Generation& generation) override;

  bool isEmpty() const;
  Plot plot(const std::string& title) const;

 private:
  struct Series {
    std::string path, label;
    std::optional<std::string> unit;  // absent before the first number
    PlotLine line;
  };
  std::vector<Series> _series;
};

/// The plot as an SVG picture, drawn by the module that comes with the program. Throws std::runtime_error
/// when it cannot be loaded.
std::string drawPlot(const Plot& plot);

}  // namespace varnel
