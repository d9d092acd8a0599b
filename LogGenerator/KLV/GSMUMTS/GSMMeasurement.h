#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/Field.h"

namespace varnel {

/// Measurements of the GSM serving cell and of its neighbors, log code 0x5137. One section shows the two
/// 32-bit values as the path loss criteria C1 and C2, another one as receive qualities.
namespace gsmMeasurement {

inline constexpr std::uint32_t logCode = 0x5137;
inline constexpr std::size_t minimumSize = 29;
inline constexpr Source receiveLevel = u8(15);
inline constexpr std::uint16_t firstValue = 16;
inline constexpr std::uint16_t secondValue = 20;
inline constexpr Source reselectHysteresis = u8(26);
inline constexpr std::size_t neighborCountOffset = 28;
inline constexpr std::size_t firstNeighbor = minimumSize;
inline constexpr std::size_t neighborSize = 14;

}  // namespace gsmMeasurement

}  // namespace varnel
