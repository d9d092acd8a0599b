#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/Packet.h"

namespace varnel {

/// Measurements of the transport channels (TrCH) and of the coded composite transport channels (CCTrCH), log
/// code 0xD00C.
namespace transportChannels {

inline constexpr std::uint32_t logCode = 0xD00C;
inline constexpr std::size_t minimumSize = 17;
inline constexpr std::size_t firstTransportChannel = minimumSize;
inline constexpr std::size_t transportChannelSize = 2;
inline constexpr std::size_t compositeChannelSize = 8;

inline std::uint32_t transportChannelCount(const Packet& packet) { return packet.bits(14, 6, 6); }
inline std::uint32_t compositeChannelCount(const Packet& packet) { return packet.bits(15, 4, 4); }
// Kept: they do not directly follow the transport channels.
inline std::size_t firstCompositeChannel(const Packet& packet) {
  return 289 + 34 * transportChannelCount(packet);
}

}  // namespace transportChannels

}  // namespace varnel
