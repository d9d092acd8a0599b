#pragma once

#include <QString>
#include <vector>

namespace varnel {

/// A moment of the time axis that has a label.
struct TimeTick {
  double milliseconds;  ///< since 1970
  QString label;        ///< of UTC
};

/// Round moments between two others, in milliseconds since 1970: multiples of 1, 2 or 5 seconds and so on up
/// to years, eight at most.
std::vector<TimeTick> timeTicks(double first, double last);

}  // namespace varnel
