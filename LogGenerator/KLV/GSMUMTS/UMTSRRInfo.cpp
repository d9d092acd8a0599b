#include "LogGenerator/KLV/GSMUMTS/UMTSRRInfo.h"

#include <limits>

#include "LogGenerator/Field.h"
#include "LogGenerator/NumberFormats.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::size_t transmitPowerSize = 16;

// 3GPP TS 25.331, 7.1.
constexpr std::string_view states[] = {
    "Disconnected", "Connecting", "CELL_FACH", "CELL_DCH", "CELL_PCH", "URA_PCH",
};
constexpr Field state[] = {
    {u8(13), "RRC State", entry(states)},
};

constexpr std::size_t sampleCountOffset = 14;
constexpr std::size_t firstSample = transmitPowerSize;
constexpr std::size_t sampleSize = 14;
constexpr Source samplePower = s16(4);

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
constexpr std::string_view transmitPowerEntry = "Transmit Power";
constexpr Format transmitPower = real("%4.2f dBm");

constexpr CellMonitorEntry cellMonitorEntries[] = {
    {cellMonitor::cellIdentity, "Cell ID", "UMTSRRInfo: Failed to retrieve Cell ID\n"},
    {cellMonitor::uarfcn, channelEntry, "UMTSRRInfo: Failed to retrieve UARFCN\n"},
    {cellMonitor::scramblingCode, "Scrambling Code", "UMTSRRInfo: Failed to retrieve Scrambling Code\n"},
};

// The mean in dBm of the samples that are not 0; NaN when there is none.
double meanTransmitPower(const Packet& packet) {
  double sum = 0;
  int used = 0;
  for (std::size_t i = 0; i < packet.u8(sampleCountOffset); ++i) {
    const Packet sample = packet.from(firstSample + sampleSize * i);
    const auto power = static_cast<std::int32_t>(rawValue(sample, samplePower));
    if (power == 0) continue;
    const std::int32_t wholeDBm = (power + 512) / 10 - 70;
    sum += wholeDBm;
    ++used;
  }
  return used > 0 ? sum / used : std::numeric_limits<double>::quiet_NaN();
}

void showTransmitPower(Section& section, const Packet& packet) {
  // Kept: without samples the text is " nan dBm".
  section.setReal(transmitPowerEntry, transmitPower, meanTransmitPower(packet));
}

// Kept: a modem packet removes "UARFCN"; only the cell monitor writes it.
void showServingCell(Section& section, const Packet& packet) {
  section.remove(channelEntry);
  section.show(packet, servingCell);
}

}  // namespace

constinit const PacketHandler UMTSRRInfo::packets[] = {
    {0x4125, 14, state},
    {0x4031, transmitPowerSize, showTransmitPower},
    {0x4127, servingCellSize, showServingCell},
    {0x4157, 19, ciphering},
    {cellMonitorLogCode, 0, calling<&UMTSRRInfo::updateFromCellMonitor>},
};

UMTSRRInfo::UMTSRRInfo(CellMonitorReader& cellMonitor)
    : SectionDecoder("UMTS RR Info", "UMTSRRInfo", packets), _cellMonitor(cellMonitor) {}

void UMTSRRInfo::listNumberFormats(SectionFormats& formats) const {
  formats.add(transmitPowerEntry, transmitPower);
}

void UMTSRRInfo::updateFromCellMonitor(const Packet& packet) {
  const Array* records = _cellMonitor.read(packet);
  if (!records) return;
  const Dictionary* cell = firstCellOfKind(*records, cellMonitor::umts, cellMonitor::serving);
  if (cell) showCell(sectionRef, *cell, cellMonitorEntries);
}

}  // namespace varnel
