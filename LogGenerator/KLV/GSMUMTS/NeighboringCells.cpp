#include "LogGenerator/KLV/GSMUMTS/NeighboringCells.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/GSMMeasurement.h"
#include "LogGenerator/NumberFormats.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::size_t identityCodesSize = 15;
constexpr std::size_t identityCodeCountOffset = 14;
constexpr std::size_t identityCodeSize = 4;
constexpr Source identityCodeChannel = u16(0);
constexpr Source identityCode = u8(2);

constexpr Source channel = u16(0);
constexpr Field cell[] = {
    {channel, "ARFCN"},
    {u8(2), "RSSI"},
    {u32(3), "C1 Value"},
};
static_assert(extent(cell) <= gsmMeasurement::neighborSize);

using Width = CellMonitorColumn::Width;
constexpr CellMonitorColumn cellMonitorColumns[] = {
    {cellMonitor::arfcn, "ARFCN", "NeighboringCells: Failed to retrieve ARFCN\n", Width::Unsigned16},
    {cellMonitor::rssi, "RSSI", "NeighboringCells: Failed to retrieve RSSI\n", Width::Signed16,
     integer("%d dBm", 2)},
};

}  // namespace

constinit const PacketHandler NeighboringCells::packets[] = {
    {gsmMeasurement::logCode, gsmMeasurement::minimumSize, calling<&NeighboringCells::updateMeasurements>},
    {0x51FF, identityCodesSize, calling<&NeighboringCells::updateIdentityCodes>},
    {cellMonitorLogCode, 0, calling<&NeighboringCells::updateFromCellMonitor>},
};

NeighboringCells::NeighboringCells(CellMonitorReader& cellMonitor)
    : SectionDecoder("Neighboring Cells", "NeighboringCells", packets), _cellMonitor(cellMonitor) {}

void NeighboringCells::listNumberFormats(SectionFormats& formats) const {
  formats.add(cell);
  formats.add(cellMonitorColumns);
}

void NeighboringCells::updateMeasurements(const Packet& packet) {
  using namespace gsmMeasurement;
  sectionRef.refill([&](Array& cells) {
    for (std::size_t i = 0; i < packet.u8(neighborCountOffset); ++i) {
      const Packet neighbor = packet.from(firstNeighbor + neighborSize * i);
      const Value& record = cells.emplace_back(recordOf(neighbor, cell));
      const auto bsic = arfcnToBsic.find(static_cast<std::uint16_t>(rawValue(neighbor, channel)));
      if (bsic != arfcnToBsic.end()) setInteger(*record.dictionary(), "BSIC", integer(), bsic->second);
    }
  });
}

void NeighboringCells::updateIdentityCodes(const Packet& packet) {
  arfcnToBsic.clear();
  for (std::size_t i = 0; i < packet.u8(identityCodeCountOffset); ++i) {
    const Packet record = packet.from(identityCodesSize + identityCodeSize * i);
    const auto arfcn = static_cast<std::uint16_t>(rawValue(record, identityCodeChannel));
    arfcnToBsic[arfcn] = static_cast<std::uint8_t>(rawValue(record, identityCode));
  }
}

void NeighboringCells::updateFromCellMonitor(const Packet& packet) {
  const Array* records = _cellMonitor.read(packet);
  sectionRef.refill([&](Array& cells) {
    if (records) addCells(cells, *records, cellMonitor::gsm, cellMonitor::neighbor, cellMonitorColumns);
  });
}

}  // namespace varnel
