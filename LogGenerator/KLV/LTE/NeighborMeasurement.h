#pragma once

#include <cstddef>
#include <cstdint>

namespace varnel {

/// The idle-mode neighbor measurement, log code 0xB180: one frequency, then its cells.
namespace neighborMeasurement {

inline constexpr std::uint32_t logCode = 0xB180;
inline constexpr std::size_t minimumSize = 21;

}  // namespace neighborMeasurement

}  // namespace varnel
