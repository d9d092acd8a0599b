#include "LogGenerator/Radios/UMTS/ActiveSet.h"

#include <optional>

#include "LogGenerator/KLV/GSMUMTS/CellSet.h"
#include "LogGenerator/NumberFormats.h"

namespace varnel::radios {

namespace {

constexpr std::string_view powerEntry = "RSCP", ratioEntry = "Energy Per Chip";
constexpr Format power = integer("%d dBm"), ratio = integer("%d dB");
constexpr Field identity[] = {{cellSet::scramblingCode, "Scrambling Code"}};

// The ratio Ec/N0. Absent without an energy, and below the table, which shows 0 dB for both.
std::optional<std::int16_t> ratioOf(const Packet& energies) {
  constexpr std::uint32_t strongestOfTable = 524287;
  const std::uint32_t energy = cellSet::firstEnergy(energies);
  const std::int16_t found = Base::lookUpECNO(energy);
  if (found == 0 && energy <= strongestOfTable) return std::nullopt;
  return found;
}

void update(Section& section, const Packet& packet) {
  const std::int32_t strength = cellSet::receivedSignalStrength(packet);
  const std::size_t count = packet.u8(cellSet::countOffset);
  const std::size_t allCells = cellSet::cellSize * count;
  section.refill([&](Array& cells) {
    for (std::size_t i = 0; i < count; ++i) {
      if (!packet.holds(cellSet::firstCell + allCells + cellSet::energySize * i, cellSet::energySize)) return;
      const Packet cell = cellSet::cell(packet, i);
      if (rawValue(cell, cellSet::membership) != cellSet::activeSet) continue;
      Dictionary& record = *cells.emplace_back(recordOf(cell, identity)).dictionary();
      const auto ecNo = ratioOf(cellSet::energy(packet, i));
      if (!ecNo) continue;
      setInteger(record, powerEntry, power, strength + *ecNo);
      setInteger(record, ratioEntry, ratio, *ecNo);
    }
  });
}

constexpr PacketHandler packets[] = {{cellSet::logCode, cellSet::minimumSize, update}};

}  // namespace

ActiveSet::ActiveSet() : SectionDecoder("Active Set", "ActiveSet", packets) {}

void ActiveSet::listNumberFormats(SectionFormats& formats) const {
  formats.add(powerEntry, power);
  formats.add(ratioEntry, ratio);
}

}  // namespace varnel::radios
