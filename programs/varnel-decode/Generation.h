#pragma once

#include "base/Time.h"
#include "base/Value.h"

namespace varnel {

/// One display that was generated, and when. The display is live: what it shows changes with the next
/// message.
struct Generation {
  Time time;
  Value display;
};

}  // namespace varnel
