#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "tests/support/PacketBuilder.h"

namespace varnel {

inline constexpr std::uint32_t cellSetCode = 0x417A;

/// One cell of a UMTS cell set packet.
struct MeasuredCell {
  std::uint16_t scramblingCodeAndSet = 0;  ///< the code in the low 13 bits, the set membership above it
  std::array<std::uint32_t, 3> energies{};
};

/// A UMTS cell set packet: the signal reading, then all cells, then the energies of all cells. Bytes that no
/// entry may show are 0xEE.
inline PacketBuilder cellSetPacket(std::int16_t reading, const std::vector<MeasuredCell>& cells) {
  const std::size_t energies = 16 + 15 * cells.size();
  PacketBuilder packet(cellSetCode, energies + 44 * cells.size());
  packet.fill(0xEE).u16(13, static_cast<std::uint16_t>(reading));
  packet.u8(15, static_cast<std::uint8_t>(cells.size()));
  for (std::size_t i = 0; i < cells.size(); ++i) {
    packet.u16(16 + 15 * i + 7, cells[i].scramblingCodeAndSet);
    for (std::size_t k = 0; k < 3; ++k) packet.u32(energies + 44 * i + 32 + 4 * k, cells[i].energies[k]);
  }
  return packet;
}

}  // namespace varnel
