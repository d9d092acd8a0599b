#pragma once

#include <cstdint>

#include "host/captures/CaptureRecord.h"

namespace varnel {

/// A modem's own time, as the records that it sends carry it: the upper 48 bits count 1.25 ms since
/// 1980-01-06 00:00:00, the lower 16 are 49152ths of that. It runs with UTC.
struct ModemTime {
  std::uint64_t raw = 0;
};

/// Where a modem's clock starts.
inline constexpr Time modemEpoch{315'964'800, 0};

/// The moment, rounded to nanoseconds.
Time timeOf(ModemTime time);

/// Before 1990 a modem counts from its own start, and so the date is unknown.
Dating datingOf(ModemTime time);

/// The modem's time that is nearest to the moment. Moments before its first and after its last become those.
ModemTime modemTimeOf(Time time);

}  // namespace varnel
