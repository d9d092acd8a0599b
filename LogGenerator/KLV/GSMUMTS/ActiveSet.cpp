#include "LogGenerator/KLV/GSMUMTS/ActiveSet.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/CellSet.h"
#include "LogGenerator/NumberFormats.h"

namespace varnel {

namespace {

constexpr Field identity[] = {
    {cellSet::scramblingCode, "Scrambling Code"},
};
// Kept: the value is a power and should be in dBm.
constexpr Format level = integer("%d dB");

void update(Section& section, const Packet& packet) {
  const std::int32_t strength = cellSet::receivedSignalStrength(packet);
  section.refill([&](Array& cells) {
    for (std::size_t i = 0; i < packet.u8(cellSet::countOffset); ++i) {
      const Packet cell = cellSet::cell(packet, i);
      if (rawValue(cell, cellSet::membership) != cellSet::activeSet) continue;
      const std::int16_t ecNo = Base::lookUpECNO(cellSet::firstEnergy(cellSet::energy(packet, i)));
      const Value& record = cells.emplace_back(recordOf(cell, identity));
      setInteger(*record.dictionary(), "RSCP", level, strength + ecNo);
      setInteger(*record.dictionary(), "Energy Per Chip", level, ecNo);
    }
  });
}

constexpr PacketHandler packets[] = {
    {cellSet::logCode, cellSet::minimumSize, update},
};

}  // namespace

ActiveSet::ActiveSet() : SectionDecoder("Active Set", "ActiveSet", packets) {}

void ActiveSet::listNumberFormats(SectionFormats& formats) const {
  formats.add("RSCP", level);
  formats.add("Energy Per Chip", level);
}

}  // namespace varnel
