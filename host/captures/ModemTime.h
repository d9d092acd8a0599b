#pragma once

#include <cstdint>

#include "host/captures/CaptureRecord.h"

namespace varnel {

/// A modem's own time, as in its records. The upper 48 bits count units of 1.25 ms since 1980-01-06 00:00:00
/// UTC; the lower 16 bits are 49152ths of a unit.
struct ModemTime {
  std::uint64_t raw = 0;
};

/// The moment at which a modem's time is 0.
inline constexpr Time modemEpoch{315'964'800, 0};

/// The moment of a modem's time, rounded to nanoseconds.
Time timeOf(ModemTime time);

/// A time before 1990 counts from the modem's own start, so its date is unknown.
Dating datingOf(ModemTime time);

/// The modem's time nearest to the moment. A moment out of range becomes the first or the last time.
ModemTime modemTimeOf(Time time);

}  // namespace varnel
