#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>

#include "LogGenerator/Field.h"

namespace varnel {

/// Samples of the uplink's transmit power, log code 0x4031.
namespace umtsTransmitPower {

inline constexpr std::uint32_t logCode = 0x4031;
inline constexpr std::size_t minimumSize = 16;
inline constexpr std::size_t countOffset = 14;
inline constexpr std::size_t firstSample = minimumSize;
inline constexpr std::size_t sampleSize = 14;
inline constexpr Source samplePower = s16(4);

inline constexpr std::string_view label = "Transmit Power";
inline constexpr Format levelFormat = real("%4.2f dBm");

/// The mean of the samples that are not 0; absent when there is none.
inline std::optional<double> mean_dbm(const Packet& packet) {
  double sum = 0;
  int used = 0;
  for (std::size_t i = 0; i < packet.u8(countOffset); ++i) {
    const Packet sample = packet.from(firstSample + sampleSize * i);
    const auto power = static_cast<std::int32_t>(rawValue(sample, samplePower));
    if (power == 0) continue;
    const std::int32_t wholeDBm = (power + 512) / 10 - 70;
    sum += wholeDBm;
    ++used;
  }
  return used > 0 ? std::optional(sum / used) : std::nullopt;
}

}  // namespace umtsTransmitPower

}  // namespace varnel
