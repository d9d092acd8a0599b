#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "programs/shared/Generation.h"
#include "programs/varnel-decode/plot/Plot.h"

namespace varnel {

/// A text that begins with a number, as displays show measurements: "-85 dBm", "12.50 dB", "7", "0x1F".
struct Measurement {
  double number;
  std::string unit;  ///< what follows the number if it looks like a unit; else empty
};
/// Nothing for a text that does not begin with a number. Leading blanks are ignored.
std::optional<Measurement> measurementIn(std::string_view text);

/// Values over time. Each value holds until the next one. They are thinned out as they come in: for each of a
/// thousand columns of the picture, the lowest, the mean, and the highest value are kept. Gaps narrower than
/// a column are closed. Short sequences are kept whole.
class PlotLine {
 public:
  static constexpr std::size_t mostColumns = 1000;

  /// Seconds since 1970, not before the year 1. Where the clock was set (`clockStep`), a new line begins.
  void add(double seconds, double value);
  /// There is no value from this time on: the line ends.
  void interrupt(double seconds);

  bool isEmpty() const { return _columns.empty(); }
  std::vector<PlotPoint> points() const;

 private:
  struct Column {
    std::int64_t number;
    double start, until;
    double lowest, highest, sum;
    std::uint64_t count;
    bool startsNewLine;

    void take(const Column& later);
  };

  void halve();
  bool isNextTo(std::int64_t number) const;

  std::vector<Column> _columns;
  double _width = 1.0 / 1024;  // of each column, in seconds; doubled whenever there are too many columns
  double _latest = 0;
  bool _isInterrupted = false;
};

/// Collects the numbers under some paths for a picture.
class PlotRecorder {
 public:
  explicit PlotRecorder(const std::vector<std::string>& paths);
  void take(const Generation& generation);

  bool isEmpty() const;
  /// The picture of all paths with numbers. If the first record has no date, times are seconds since that
  /// record. A later record without a date is placed by the time that has passed. The common part of all
  /// labels is in the title.
  Plot plot(const std::string& title) const;

  /// A path whose values do not begin with numbers.
  struct Unplotted {
    std::string path, value;
  };
  std::vector<Unplotted> unplotted() const;

 private:
  struct Series {
    std::string path;
    std::optional<std::string> unit;       // absent before the first number
    std::optional<std::string> otherText;  // the first value that is no number
    PlotLine line;
  };
  double secondsOf(const Generation& generation);

  std::vector<Series> _series;
  std::optional<PlotTimes> _times;  // decided by the first display
  double _first = 0;                // where the elapsed time begins
};

/// The plot as an SVG picture, drawn by the module that comes with the program. Throws std::runtime_error
/// when the module cannot be loaded.
std::string drawPlot(const Plot& plot);

}  // namespace varnel
