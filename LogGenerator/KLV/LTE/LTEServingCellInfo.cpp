#include "LogGenerator/KLV/LTE/LTEServingCellInfo.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::uint32_t transmitAntennasLogCode = 0xB0C1;

// Channel bandwidths by their number of resource blocks, 3GPP TS 36.101, 5.6.
constexpr Choice bandwidths[] = {
    {6, "1.4 MHz"}, {15, "3 MHz"}, {25, "5 MHz"}, {50, "10 MHz"}, {75, "15 MHz"}, {100, "20 MHz"},
};
constexpr Format bandwidth = choice(bandwidths, "Unknown");

constexpr std::size_t transmitAntennasSize = 22;
constexpr Field transmitAntennas[] = {
    {u8(20), "Num Tx Antennas"},
};
static_assert(extent(transmitAntennas) <= transmitAntennasSize);

// Frequencies are E-UTRA absolute radio frequency channel numbers (EARFCN), not MHz.
constexpr std::size_t identitySize = 38;
constexpr Field identity[] = {
    {u16(14), "Physical Cell ID"},           {u16(16), "Download Frequency"},
    {u16(18), "Upload Frequency"},           {u8(20), "Download Bandwidth", bandwidth},
    {u8(21), "Upload Bandwidth", bandwidth}, {u32(22), "Cell Identity"},
    {u16(26), "Tracking Area Code"},         {u32(28), "Freq Band Indicator"},
};
static_assert(extent(identity) <= identitySize);

constexpr std::string_view channelEntry = "UARFCN";

constexpr CellMonitorEntry cellMonitorEntries[] = {
    {cellMonitor::trackingAreaCode, "Tracking Area Code", "Serving Cell Info: Failed to retrieve TAC\n"},
    {cellMonitor::cellIdentity, "Cell Identity", "Serving Cell Info: Failed to retrieve Cell ID\n"},
    {cellMonitor::physicalCellIdentity, "Physical Cell ID",
     "Serving Cell Info: Failed to retrieve Physical Cell ID\n"},
    {cellMonitor::bandInfo, "Freq Band Indicator",
     "Serving Cell Info: Failed to retrieve Freq Band Indicator\n"},
    {cellMonitor::uarfcn, channelEntry, "Serving Cell Info: Failed to retrieve UARFCN\n"},
};

// Kept: a modem packet removes "UARFCN"; only the cell monitor writes it.
void showIdentity(Section& section, const Packet& packet) {
  section.remove(channelEntry);
  section.show(packet, identity);
}

void showTransmitAntennas(Section& section, const Packet& packet) {
  section.show(packet, transmitAntennas);
  // Kept: the code is known, and the packet was shown. It is reported as unknown nevertheless.
  logUnknownCode(transmitAntennasLogCode);
}

void showServingCell(Section& section, const Packet& packet) {
  const auto cells = readCellMonitorArray(packet);
  if (!cells) return logError("Failed to get Cell Array\n");
  const Dictionary* cell = firstCellOfKind(*cells->array(), cellMonitor::lte, cellMonitor::serving);
  if (cell) showCell(section, *cell, cellMonitorEntries);
}

constexpr PacketHandler packets[] = {
    {0xB0C2, identitySize, showIdentity},
    {transmitAntennasLogCode, transmitAntennasSize, showTransmitAntennas},
    {cellMonitorLogCode, 0, showServingCell},
};

}  // namespace

LTEServingCellInfo::LTEServingCellInfo()
    : SectionDecoder("Serving Cell Info", "LTE Serving Cell Info", packets) {}

}  // namespace varnel
