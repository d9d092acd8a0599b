#include "LogGenerator/KLV/GSMUMTS/UMTSRRInfo.h"

#include <limits>

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/UMTSTransmitPower.h"
#include "LogGenerator/NumberFormats.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

// 3GPP TS 25.331, 7.1.
constexpr std::string_view states[] = {
    "Disconnected", "Connecting", "CELL_FACH", "CELL_DCH", "CELL_PCH", "URA_PCH",
};
constexpr Field state[] = {
    {u8(13), "RRC State", entry(states)},
};

constexpr std::size_t servingCellSize = 29;
constexpr Field servingCell[] = {
    {u32(21), "Cell ID"},
    {u32(17), "Downlink Frequency"},
    {u32(13), "Uplink Frequency"},
    {u16(25), "URA ID"},
};
static_assert(extent(servingCell) <= servingCellSize);

constexpr Choice off[] = {{0, "Disabled"}};
constexpr Field ciphering[] = {
    {u8(13), "Ciphering", choice(off, "Enabled")},
};

constexpr std::string_view channelEntry = "UARFCN";

constexpr CellMonitorEntry cellMonitorEntries[] = {
    {cellMonitor::cellIdentity, "Cell ID", "UMTSRRInfo: Failed to retrieve Cell ID\n"},
    {cellMonitor::uarfcn, channelEntry, "UMTSRRInfo: Failed to retrieve UARFCN\n"},
    {cellMonitor::scramblingCode, "Scrambling Code", "UMTSRRInfo: Failed to retrieve Scrambling Code\n"},
};

void showTransmitPower(Section& section, const Packet& packet) {
  const auto mean_dbm = umtsTransmitPower::mean_dbm(packet);
  // Kept: without samples the text is " nan dBm".
  section.setReal(umtsTransmitPower::label, umtsTransmitPower::levelFormat,
                  mean_dbm.value_or(std::numeric_limits<double>::quiet_NaN()));
}

// Kept: a modem packet removes "UARFCN"; only the cell monitor writes it.
void showServingCell(Section& section, const Packet& packet) {
  section.remove(channelEntry);
  section.show(packet, servingCell);
}

}  // namespace

constinit const PacketHandler UMTSRRInfo::packets[] = {
    {0x4125, 14, state},
    {umtsTransmitPower::logCode, umtsTransmitPower::minimumSize, showTransmitPower},
    {0x4127, servingCellSize, showServingCell},
    {0x4157, 19, ciphering},
    {cellMonitorLogCode, 0, calling<&UMTSRRInfo::updateFromCellMonitor>},
};

UMTSRRInfo::UMTSRRInfo(CellMonitorReader& cellMonitor) : UMTSRRInfo(cellMonitor, packets) {}

UMTSRRInfo::UMTSRRInfo(CellMonitorReader& cellMonitor, std::span<const PacketHandler> handlers)
    : SectionDecoder("UMTS RR Info", "UMTSRRInfo", handlers), _cellMonitor(cellMonitor) {}

std::span<const PacketHandler> UMTSRRInfo::ownHandlers() { return packets; }

void UMTSRRInfo::listNumberFormats(SectionFormats& formats) const {
  formats.add(umtsTransmitPower::label, umtsTransmitPower::levelFormat);
}

void UMTSRRInfo::updateFromCellMonitor(const Packet& packet) {
  const Array* records = _cellMonitor.read(packet);
  if (!records) return;
  const Dictionary* cell = firstCellOfKind(*records, cellMonitor::umts, cellMonitor::serving);
  if (cell) showCell(sectionRef, *cell, cellMonitorEntries);
}

}  // namespace varnel
