#pragma once

#include <QString>
#include <vector>

#include "programs/varnel-decode/plot/Plot.h"

namespace varnel {

/// A moment on the time axis with a label.
struct TimeTick {
  double milliseconds;  ///< since 1970, or since the first record
  QString label;        ///< a time in UTC, or seconds
};

/// Round moments between two others, in milliseconds since 1970: multiples of 1, 2, or 5 seconds and so on up
/// to years. At most eight.
std::vector<TimeTick> timeTicks(double first, double last, PlotTimes times);

}  // namespace varnel
