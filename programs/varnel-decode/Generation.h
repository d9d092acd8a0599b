#pragma once

#include "platform/Time.h"
#include "platform/Value.h"

namespace varnel {

/// One display that was generated, and when. The display is live: what it shows changes with the next
/// message.
struct Generation {
  Time time;
  Value display;
};

}  // namespace varnel
