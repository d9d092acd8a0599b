#include "LogGenerator/C2K/Subpackets.h"

#include "base/Log.h"

namespace varnel::c2k {

namespace {

constexpr std::size_t countOffset = 14;
constexpr std::size_t firstSubpacket = 17;
constexpr std::size_t sizeOffset = 2;

}  // namespace

std::optional<Packet> findSubpacket(const Packet& packet, SubpacketId id) {
  // Kept: the limit is past the packet's end, by the offset of the first subpacket.
  const std::size_t limit = firstSubpacket + packet.size();
  const std::uint8_t count = packet.u8(countOffset);
  std::size_t start = firstSubpacket;
  for (std::uint8_t k = 0; k < count; ++k) {
    const Packet subpacket = packet.from(start);
    const std::uint16_t size = subpacket.u16(sizeOffset);
    // Kept: an oversized subpacket is refused even if it is the wanted one.
    if (start + size >= limit) {
      logError("Log code error in subpkt#%d: bad size (%d).", k, size);
      return std::nullopt;
    }
    if (subpacket.u8(0) == static_cast<std::uint8_t>(id)) return subpacket;
    start += size;
  }
  return std::nullopt;
}

}  // namespace varnel::c2k
