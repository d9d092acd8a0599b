#pragma once

#include <string>
#include <vector>

#include "app/ValueHistory.h"

namespace varnel {

/// An axis of values with round numbers at its ticks.
struct TrendScale {
  double lowest = 0, highest = 1;  ///< multiples of the step
  double step = 1;                 ///< 1, 2, or 5 times a power of ten
  unsigned decimals = 0;           ///< of the numbers at the ticks

  friend bool operator==(const TrendScale&, const TrendScale&) = default;
};

/// The scale for values from the lowest to the highest, with at most so many steps (at least 1). Values that
/// are all the same get room above and below.
TrendScale scaleFor(double lowest, double highest, int mostSteps);

/// A number with this many decimals.
std::string numberText(double number, unsigned decimals);

/// What a table tells of the samples of a row. All texts are empty without samples.
struct TrendStatistics {
  std::string lowest, mean, highest, last;
};
/// The mean has as many decimals as the samples.
TrendStatistics statisticsOf(const ValueHistory::Summary& summary);

/// Such as "10 min", "1 h 30 min", "45 s".
std::string lengthText(ValueHistory::Duration length);

}  // namespace varnel
