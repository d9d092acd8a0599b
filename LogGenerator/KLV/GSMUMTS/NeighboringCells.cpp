#include "LogGenerator/KLV/GSMUMTS/NeighboringCells.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/GSMMeasurement.h"
#include "LogGenerator/NumberFormats.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::uint32_t identityCodesLogCode = 0x51FF;
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
static_assert(within(cell, gsmMeasurement::neighborSize));

using Width = CellMonitorColumn::Width;
constexpr CellMonitorColumn cellMonitorColumns[] = {
    {cellMonitor::arfcn, "ARFCN", "NeighboringCells: Failed to retrieve ARFCN\n", Width::Unsigned16},
    {cellMonitor::rssi, "RSSI", "NeighboringCells: Failed to retrieve RSSI\n", Width::Signed16,
     integer("%d dBm", 2)},
};

}  // namespace

constinit const PacketHandlers<NeighboringCells> NeighboringCells::handlers = {
    {gsmMeasurement::logCode, gsmMeasurement::minimumSize, &NeighboringCells::updateMeasurements},
    {identityCodesLogCode, identityCodesSize, &NeighboringCells::updateIdentityCodes},
    {cellMonitorLogCode, 0, &NeighboringCells::updateFromCellMonitor},
};

void NeighboringCells::listNumberFormats(SectionFormats& formats) const {
  formats.add(cell);
  formats.add(cellMonitorColumns);
}

void NeighboringCells::updateMeasurements(const Packet& packet) {
  using namespace gsmMeasurement;
  clearElementsInArray(list());
  Array cells;
  for (std::size_t i = 0; i < packet.u8(neighborCountOffset); ++i) {
    const Packet record = packet.from(firstNeighbor + neighborSize * i);
    Value row = fieldRow(record, cell);
    const auto bsic = arfcnToBsic.find(static_cast<std::uint16_t>(rawValue(record, channel)));
    if (bsic != arfcnToBsic.end()) setInteger(*row.dictionary(), "BSIC", integer(), bsic->second);
    cells.push_back(std::move(row));
  }
  replaceArray_With(list(), std::move(cells));
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
  clearElementsInArray(list());
  if (!records) return;
  replaceArray_With(list(),
                    cellMonitorList(*records, cellMonitor::gsm, cellMonitor::neighbor, cellMonitorColumns));
}

}  // namespace varnel
