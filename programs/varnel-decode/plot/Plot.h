#pragma once

#include <string>
#include <vector>

namespace varnel {

/// One value that was shown for a while, or several that follow each other within one column of the picture.
struct PlotPoint {
  double seconds;  ///< since 1970-01-01 00:00:00 UTC, or since the first record
  double until;    ///< when the last of its values ended
  double lowest, mean, highest;
  bool startsNewLine;  ///< no line connects it with the point before

  friend bool operator==(const PlotPoint&, const PlotPoint&) = default;
};

/// The values of one path.
struct PlotSeries {
  std::string label;
  std::string unit;  ///< "dBm" and the like; empty for numbers without one
  std::vector<PlotPoint> points;
};

/// The origin of the times.
enum class PlotTimes { SinceEpoch, SinceFirstRecord };

/// The contents of a picture.
struct Plot {
  std::string title;
  std::vector<PlotSeries> series;
  PlotTimes times = PlotTimes::SinceEpoch;
};

}  // namespace varnel
