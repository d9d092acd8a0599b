#pragma once

#include <QString>
#include <vector>

namespace varnel {

/// A moment on the time axis with a label.
struct TimeTick {
  double milliseconds;  ///< since 1970, or since the first record
  QString label;        ///< a time of day, perhaps with its date, or seconds
};

/// What the labels of moments tell.
enum class TickLabels { TimeOfDay, Seconds };

/// Round moments between two others, in milliseconds since 1970: multiples of 1, 2, or 5 seconds and so on up
/// to years. At most so many (up to eight). The offset is that of the zone for times of day, in milliseconds.
std::vector<TimeTick> timeTicks(double first, double last, TickLabels labels, double offset = 0,
                                int most = 8);

}  // namespace varnel
