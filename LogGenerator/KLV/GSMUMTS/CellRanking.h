#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/Field.h"

namespace varnel {

/// The cells by their rank for reselection, log code 0x4005.
namespace cellRanking {

inline constexpr std::uint32_t logCode = 0x4005;
inline constexpr std::size_t minimumSize = 15;
inline constexpr std::size_t umtsCountOffset = 13;
inline constexpr std::size_t gsmCountOffset = 14;
inline constexpr std::size_t umtsRecordSize = 10;
inline constexpr std::size_t gsmRecordSize = 7;
/// Kept: the GSM records start where the UMTS records start, not after them.
inline constexpr std::size_t firstRecord = minimumSize;

}  // namespace cellRanking

}  // namespace varnel
