#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/Field.h"

namespace varnel {

/// The GPRS cell options, log code 0x51F6 (3GPP TS 44.060, 12.24).
namespace gprsCellOptions {

inline constexpr std::uint32_t logCode = 0x51F6;
inline constexpr std::size_t minimumSize = 24;
inline constexpr Source t3192 = u8(15);
/// In seconds.
inline constexpr Source drxTimerMaximum = u8(16);
inline constexpr Source accessBurstType = u8(17);

}  // namespace gprsCellOptions

}  // namespace varnel
