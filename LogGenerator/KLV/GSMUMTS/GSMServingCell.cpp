#include "LogGenerator/KLV/GSMUMTS/GSMServingCell.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/GSMMeasurement.h"
#include "LogGenerator/NumberFormats.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::uint32_t identityLogCode = 0x5134;
constexpr std::size_t identitySize = 26;
constexpr std::uint32_t dedicatedChannelLogCode = 0x5076;
constexpr std::size_t dedicatedChannelSize = 17;

constexpr std::string_view cellRow = "Cell ID";
constexpr std::string_view channelRow = "ARFCN";

constexpr Field identity[] = {
    {u16(17), cellRow},
    {u16(13), channelRow},
    {u16(15), "BSIC"},
};
static_assert(within(identity, identitySize));

constexpr Field dedicatedChannel[] = {
    // Kept: the low byte of two.
    {u8(13), "MA Dedicated ARFCN"},
};
static_assert(within(dedicatedChannel, dedicatedChannelSize));

constexpr Field measurement[] = {
    {gsmMeasurement::receiveLevel, "RSSI", integer("%d dBm")},
    // Kept: the low 16 bits, without a sign.
    {u16(gsmMeasurement::firstValue), "C1 Value"},
    {u16(gsmMeasurement::secondValue), "C2 Value"},
};
static_assert(within(measurement, gsmMeasurement::minimumSize));

constexpr CellMonitorRow cellMonitorRows[] = {
    {cellMonitor::cellIdentity, cellRow, "GSMServingCell: Failed to retrieve Cell ID\n"},
    {cellMonitor::arfcn, channelRow, "GSMServingCell: Failed to retrieve ARFCN\n"},
};

}  // namespace

constinit const PacketHandlers<GSMServingCell> GSMServingCell::handlers = {
    {identityLogCode, identitySize, &GSMServingCell::updateIdentity},
    {gsmMeasurement::logCode, gsmMeasurement::minimumSize, &GSMServingCell::updateMeasurement},
    {dedicatedChannelLogCode, dedicatedChannelSize, &GSMServingCell::updateDedicatedChannel},
    {cellMonitorLogCode, 0, &GSMServingCell::updateFromCellMonitor},
};

void GSMServingCell::listNumberFormats(SectionFormats& formats) const { formats.add(measurement); }

void GSMServingCell::updateIdentity(const Packet& packet) { setFields(rows(), packet, identity); }

void GSMServingCell::updateMeasurement(const Packet& packet) { setFields(rows(), packet, measurement); }

void GSMServingCell::updateDedicatedChannel(const Packet& packet) {
  setFields(rows(), packet, dedicatedChannel);
}

void GSMServingCell::updateFromCellMonitor(const Packet& packet) {
  const Array* records = _cellMonitor.read(packet);
  if (!records) return;
  const Dictionary* cell = firstCellOfKind(*records, cellMonitor::gsm, cellMonitor::serving);
  if (cell) showCellMonitorRows(rows(), *cell, cellMonitorRows);
}

}  // namespace varnel
