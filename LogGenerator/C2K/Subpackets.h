#pragma once

#include <cstdint>
#include <optional>

#include "LogGenerator/Packet.h"

namespace varnel::c2k {

/// Subpackets in the packets of the 1x searcher and the 1x demodulator.
enum class SubpacketId : std::uint8_t {
  SystemState = 1,
  RF = 2,
  ActiveSetInfo = 3,
  FingerInfo = 4,
  TrafficDemodulation = 11,
};

/// The first subpacket with this id, as a view from its first byte to the end of the packet; nothing when
/// there is none. A size that reaches too far out of the packet writes a log line and ends the search.
///
/// Byte 14 of the packet is the number of subpackets. They follow each other from byte 17 on. Each begins
/// with its id (1 byte), a byte without meaning, and its size (2 bytes), which includes these four bytes.
std::optional<Packet> findSubpacket(const Packet& packet, SubpacketId id);

}  // namespace varnel::c2k
