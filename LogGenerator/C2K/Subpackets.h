#pragma once

#include <cstdint>
#include <optional>

#include "LogGenerator/Packet.h"

namespace varnel::c2k {

/// Subpackets of the 1x searcher's and the 1x demodulator's packets.
enum class SubpacketId : std::uint8_t {
  SystemState = 1,
  RF = 2,
  ActiveSetInfo = 3,
  FingerInfo = 4,
  TrafficDemodulation = 11,
};

/// The first subpacket with that id, as a view from its first byte to the end of the packet; nothing when
/// there is none. A size that leads too far out of the packet is logged and ends the search.
///
/// Byte 14 of the packet is the number of subpackets, which follow one another from 17 on. Each begins with
/// its id (1 byte), a byte of no meaning, and its size (2), these four included.
std::optional<Packet> findSubpacket(const Packet& packet, SubpacketId id);

}  // namespace varnel::c2k
