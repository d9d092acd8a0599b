#pragma once

#include <string>
#include <vector>

namespace varnel {

/// What was shown for a while: one value, or several that follow each other within a column of the picture.
struct PlotPoint {
  double seconds;  ///< since 1970-01-01 00:00:00 UTC, or since the first record
  double until;    ///< when the last of its values was no longer shown
  double lowest, mean, highest;
  bool startsNewLine;  ///< no line leads here from the point before

  friend bool operator==(const PlotPoint&, const PlotPoint&) = default;
};

/// The values of one path.
struct PlotSeries {
  std::string label;
  std::string unit;  ///< "dBm" and the like; empty for numbers without one
  std::vector<PlotPoint> points;
};

/// What its times are counted from.
enum class PlotTimes { SinceEpoch, SinceFirstRecord };

/// What a picture shows.
struct Plot {
  std::string title;
  std::vector<PlotSeries> series;
  PlotTimes times = PlotTimes::SinceEpoch;
};

}  // namespace varnel
