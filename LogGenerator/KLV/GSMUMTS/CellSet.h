#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/Field.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UMTS cells that the phone measures, and their sets, log code 0x417A: records of the cells, then
/// records of their energies.
namespace cellSet {

inline constexpr std::uint32_t logCode = 0x417A;
inline constexpr std::size_t minimumSize = 16;
inline constexpr Source receivedSignal = s16(13);
inline constexpr std::size_t countOffset = 15;
inline constexpr std::size_t firstCell = minimumSize;
inline constexpr std::size_t cellSize = 15;
inline constexpr std::size_t energySize = 44;

// In a cell record.
inline constexpr Source scramblingCode = bits(7, 0, 13);
inline constexpr Source membership = bits(8, 5, 3);
inline constexpr std::uint32_t activeSet = 0;

// In an energy record: linear Ec/N0. The first one that is not 0 counts.
inline constexpr Source energies[] = {u32(32), u32(36), u32(40)};

inline Packet cell(const Packet& packet, std::size_t index) {
  return packet.from(firstCell + cellSize * index);
}
inline Packet energy(const Packet& packet, std::size_t index) {
  return packet.from(firstCell + cellSize * packet.u8(countOffset) + energySize * index);
}

/// The energy that counts in an energy record; 0 when there is none.
inline std::uint32_t firstEnergy(const Packet& record) {
  for (const Source& source : energies) {
    if (const std::uint32_t energy = rawValue(record, source)) return energy;
  }
  return 0;
}

/// The sum over all cells, in dBm.
inline std::int32_t receivedSignalStrength(const Packet& packet) {
  const auto reading = static_cast<std::int32_t>(rawValue(packet, receivedSignal));
  return (reading + 512) / 10 - 106;
}

}  // namespace cellSet

/// A set of cells with a section, but without records.
/// Kept: the list becomes empty, whatever the packet holds.
class EmptyCellSet : public SectionDecoder {
 protected:
  EmptyCellSet(std::string_view sectionName, std::string_view traceLine)
      : SectionDecoder(sectionName, traceLine, packets) {}

 private:
  static void empty(Section& section, const Packet& /*packet*/) {
    section.refill([](Array& /*cells*/) {});
  }
  static constexpr PacketHandler packets[] = {{cellSet::logCode, cellSet::minimumSize, empty}};
};

}  // namespace varnel
