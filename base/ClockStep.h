#pragma once

#include "base/Time.h"

namespace varnel {

/// What happened to a capture's clock between two records that follow each other.
enum class ClockStep {
  None,        ///< it went forward by at most a day
  Overtaking,  ///< it went back by at most 10 s: nobody set it, one record overtook the other
  Back,        ///< it went back by more than 10 s
  Ahead,       ///< it went forward by more than a day
};

/// Takes any two moments. After an `Overtaking`, compare the next record with the same
/// `earlierRecord` again.
ClockStep clockStep(Time earlierRecord, Time laterRecord);

}  // namespace varnel
