#pragma once

#include <string>
#include <vector>

namespace varnel {

/// A value at a moment of a picture.
struct PlotPoint {
  double seconds;  ///< since 1970-01-01 00:00:00 UTC
  double value;
  bool startsNewLine;  ///< no line leads here from the point before

  friend bool operator==(const PlotPoint&, const PlotPoint&) = default;
};

/// The values of one path, in the order of time.
struct PlotSeries {
  std::string label;
  std::string unit;  ///< "dBm" and the like; empty for numbers without one
  std::vector<PlotPoint> points;
};

/// What a picture shows.
struct Plot {
  std::string title;
  std::vector<PlotSeries> series;
};

}  // namespace varnel
