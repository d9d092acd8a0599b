#pragma once

#include "base/Time.h"

namespace varnel {

/// How the clock that dated two records, one after the other in a capture, was going between them.
enum class ClockStep {
  None,        ///< on, by a day at most
  Overtaking,  ///< back by 10 s at most: nobody set it, the records overtook each other
  Back,        ///< back by more
  Ahead,       ///< on by more than a day
};

/// The moments may be any. After an overtaking the earlier record's is the one to compare the next with.
ClockStep clockStep(Time earlierRecord, Time laterRecord);

}  // namespace varnel
