#include "LogGenerator/KLV/LTE/LTEServingCellInfo.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::uint32_t transmitAntennasLogCode = 0xB0C1;
constexpr std::size_t transmitAntennasSize = 22;
constexpr std::uint32_t identityLogCode = 0xB0C2;
constexpr std::size_t identitySize = 38;

// Channel bandwidths by their resource blocks, 3GPP TS 36.101, 5.6.
constexpr Choice bandwidths[] = {
    {6, "1.4 MHz"}, {15, "3 MHz"}, {25, "5 MHz"}, {50, "10 MHz"}, {75, "15 MHz"}, {100, "20 MHz"},
};
constexpr Format bandwidth = choice(bandwidths, "Unknown");

constexpr Field transmitAntennas[] = {
    {u8(20), "Num Tx Antennas"},
};
static_assert(within(transmitAntennas, transmitAntennasSize));

// Frequencies are E-UTRA absolute radio frequency channel numbers (EARFCN), not MHz.
constexpr Field cellAndChannels[] = {
    {u16(14), "Physical Cell ID"},
    {u16(16), "Download Frequency"},
    {u16(18), "Upload Frequency"},
};
constexpr Field bandwidthAndArea[] = {
    {u8(20), "Download Bandwidth", bandwidth},
    {u8(21), "Upload Bandwidth", bandwidth},
    {u32(22), "Cell Identity"},
    {u16(26), "Tracking Area Code"},
    {u32(28), "Freq Band Indicator"},
};
static_assert(within(cellAndChannels, identitySize) && within(bandwidthAndArea, identitySize));

constexpr std::string_view channelRow = "UARFCN";

constexpr CellMonitorRow cellMonitorRows[] = {
    {cellMonitor::trackingAreaCode, "Tracking Area Code", "Serving Cell Info: Failed to retrieve TAC\n"},
    {cellMonitor::cellIdentity, "Cell Identity", "Serving Cell Info: Failed to retrieve Cell ID\n"},
    {cellMonitor::physicalCellIdentity, "Physical Cell ID",
     "Serving Cell Info: Failed to retrieve Physical Cell ID\n"},
    {cellMonitor::bandInfo, "Freq Band Indicator",
     "Serving Cell Info: Failed to retrieve Freq Band Indicator\n"},
    {cellMonitor::uarfcn, channelRow, "Serving Cell Info: Failed to retrieve UARFCN\n"},
};

}  // namespace

constinit const PacketHandlers<LTEServingCellInfo> LTEServingCellInfo::handlers = {
    {identityLogCode, identitySize, &LTEServingCellInfo::updateIdentity},
    {transmitAntennasLogCode, transmitAntennasSize, &LTEServingCellInfo::updateTransmitAntennas},
    {cellMonitorLogCode, 0, &LTEServingCellInfo::updateFromCellMonitor},
};

void LTEServingCellInfo::updateIdentity(const Packet& packet) {
  setFields(rows(), packet, cellAndChannels);
  // The modem's word goes before the cell monitor's, which alone writes this row.
  rows().remove(channelRow);
  setFields(rows(), packet, bandwidthAndArea);
}

void LTEServingCellInfo::updateTransmitAntennas(const Packet& packet) {
  setFields(rows(), packet, transmitAntennas);
  // Kept: the code is known and has just been shown, and is reported all the same.
  logUnknownCode(transmitAntennasLogCode);
}

void LTEServingCellInfo::updateFromCellMonitor(const Packet& packet) {
  const auto cells = readCellMonitorArray(packet);
  if (!cells) {
    logError("Failed to get Cell Array\n");
    return;
  }
  for (const Value& record : *cells->array()) {
    if (const Dictionary* cell = cellOfKind(record, cellMonitor::lte, cellMonitor::serving)) {
      showCellMonitorRows(rows(), *cell, cellMonitorRows);
      return;
    }
  }
}

}  // namespace varnel
