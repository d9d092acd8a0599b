#pragma once

#include <compare>
#include <cstdint>
#include <string>
#include <string_view>

namespace varnel {

/// The entry of a section that shows the version of its last packet, and what it adds to a version that is
/// not known.
inline constexpr std::string_view versionEntry = "Version", unknownVersionMark = " (not known)";

/// The version of a packet's layout, as the packet itself tells it.
struct PacketVersion {
  /// The packet's own number: 8 bits of LTE packets, 32 bits of NR packets.
  std::uint32_t number = 0;
  /// The subpacket that the version is about. Both are 0 when it is about the packet.
  std::uint8_t subpacket = 0, subpacketVersion = 0;

  /// "36"; of a subpacket "25.36", its id and version; of a number above 16 bits "3.2", its two halves.
  std::string text() const {
    if (subpacket != 0) return std::to_string(subpacket) + '.' + std::to_string(subpacketVersion);
    if (number > 0xFFFF) return std::to_string(number >> 16) + '.' + std::to_string(number & 0xFFFF);
    return std::to_string(number);
  }
  /// "37 (not known)".
  std::string unknownText() const { return text().append(unknownVersionMark); }

  friend auto operator<=>(const PacketVersion&,
                          const PacketVersion&) = default;  // NOLINT(modernize-use-nullptr): no pointer here
};

}  // namespace varnel
