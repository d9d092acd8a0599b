#include "base/ClockStep.h"

namespace varnel {

namespace {

constexpr std::chrono::seconds longestOvertaking{10};
constexpr std::chrono::hours longestPause{24};

}  // namespace

ClockStep clockStep(Time earlierRecord, Time laterRecord) {
  const std::chrono::nanoseconds step = durationBetween(earlierRecord, laterRecord);
  if (step > longestPause) return ClockStep::Ahead;
  if (step.count() >= 0) return ClockStep::None;
  return step >= -longestOvertaking ? ClockStep::Overtaking : ClockStep::Back;
}

}  // namespace varnel
