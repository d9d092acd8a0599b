#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/Packet.h"

namespace varnel {

/// One subpacket: a view of its bytes, with the four of id, version and size.
struct Subpacket {
  std::uint8_t id, version;
  Packet bytes;
};

/// Calls `take(const Subpacket&)` for each subpacket of a payload. The payload's second byte counts them, and
/// they follow from byte 4 on, one after the other: id (1), version (1), size (2). The size leads from one to
/// the next; the walk ends where it is below 4 or passes the payload's end.
template <class Take>
void forEachSubpacket(const Packet& payload, Take take) {
  constexpr std::size_t countOffset = 1, first = 4, headerSize = 4;
  std::size_t offset = first;
  for (unsigned left = payload.u8(countOffset); left > 0 && payload.holds(offset, headerSize); --left) {
    const std::size_t size = payload.u16(offset + 2);
    if (size < headerSize || !payload.holds(offset, size)) return;
    take(
        Subpacket{payload.u8(offset), payload.u8(offset + 1), Packet(payload.bytes().subspan(offset, size))});
    offset += size;
  }
}

}  // namespace varnel
