#include "LogGenerator/KLV/GSMUMTS/GSMServingCell.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/GSMMeasurement.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::string_view cellEntry = "Cell ID";
constexpr std::string_view channelEntry = "ARFCN";

constexpr Field identity[] = {
    {u16(17), cellEntry},
    {u16(13), channelEntry},
    {u16(15), "BSIC"},
};

constexpr Field dedicatedChannel[] = {
    // Kept: only the low byte of two.
    {u8(13), "MA Dedicated ARFCN"},
};

constexpr Field measurement[] = {
    {gsmMeasurement::receiveLevel, "RSSI", integer("%d dBm")},
    // Kept: only the low 16 bits, without a sign.
    {u16(gsmMeasurement::firstValue), "C1 Value"},
    {u16(gsmMeasurement::secondValue), "C2 Value"},
};

constexpr CellMonitorEntry cellMonitorEntries[] = {
    {cellMonitor::cellIdentity, cellEntry, "GSMServingCell: Failed to retrieve Cell ID\n"},
    {cellMonitor::arfcn, channelEntry, "GSMServingCell: Failed to retrieve ARFCN\n"},
};

}  // namespace

constinit const PacketHandler GSMServingCell::packets[] = {
    {0x5134, 26, identity},
    {gsmMeasurement::logCode, gsmMeasurement::minimumSize, measurement},
    {0x5076, 17, dedicatedChannel},
    {cellMonitorLogCode, 0, calling<&GSMServingCell::updateFromCellMonitor>},
};

GSMServingCell::GSMServingCell(CellMonitorReader& cellMonitor) : GSMServingCell(cellMonitor, packets) {}

GSMServingCell::GSMServingCell(CellMonitorReader& cellMonitor, std::span<const PacketHandler> handlers)
    : SectionDecoder("GSM Serving Cell", "GSMServingCell", handlers), _cellMonitor(cellMonitor) {}

std::span<const PacketHandler> GSMServingCell::ownHandlers() { return packets; }

void GSMServingCell::updateFromCellMonitor(const Packet& packet) {
  const Array* records = _cellMonitor.read(packet);
  if (!records) return;
  const Dictionary* cell = firstCellOfKind(*records, cellMonitor::gsm, cellMonitor::serving);
  if (cell) showCell(sectionRef, *cell, cellMonitorEntries);
}

}  // namespace varnel
