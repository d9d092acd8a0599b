#include "LogGenerator/KLV/GSMUMTS/UMTSRRInfo.h"

#include <limits>

#include "LogGenerator/Field.h"
#include "LogGenerator/NumberFormats.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::uint32_t stateLogCode = 0x4125;
constexpr std::size_t stateSize = 14;
constexpr std::uint32_t transmitPowerLogCode = 0x4031;
constexpr std::size_t transmitPowerSize = 16;
constexpr std::uint32_t servingCellLogCode = 0x4127;
constexpr std::size_t servingCellSize = 29;
constexpr std::uint32_t cipheringLogCode = 0x4157;
constexpr std::size_t cipheringSize = 19;

// 3GPP TS 25.331, 7.1.
constexpr std::string_view states[] = {
    "Disconnected", "Connecting", "CELL_FACH", "CELL_DCH", "CELL_PCH", "URA_PCH",
};
constexpr Field state[] = {
    {u8(13), "RRC State", entry(states)},
};
static_assert(within(state, stateSize));

constexpr std::size_t sampleCountOffset = 14;
constexpr std::size_t firstSample = transmitPowerSize;
constexpr std::size_t sampleSize = 14;
constexpr Source samplePower = s16(4);

constexpr Field cellAndChannels[] = {
    {u32(21), "Cell ID"},
    {u32(17), "Downlink Frequency"},
    {u32(13), "Uplink Frequency"},
};
constexpr Field registrationArea[] = {
    {u16(25), "URA ID"},
};
static_assert(within(cellAndChannels, servingCellSize) && within(registrationArea, servingCellSize));

constexpr Choice off[] = {{0, "Disabled"}};
constexpr Field ciphering[] = {
    {u8(13), "Ciphering", choice(off, "Enabled")},
};
static_assert(within(ciphering, cipheringSize));

constexpr std::string_view channelRow = "UARFCN";
constexpr std::string_view transmitPowerRow = "Transmit Power";
constexpr Format transmitPower = real("%4.2f dBm");

constexpr CellMonitorRow cellMonitorRows[] = {
    {cellMonitor::cellIdentity, "Cell ID", "UMTSRRInfo: Failed to retrieve Cell ID\n"},
    {cellMonitor::uarfcn, channelRow, "UMTSRRInfo: Failed to retrieve UARFCN\n"},
    {cellMonitor::scramblingCode, "Scrambling Code", "UMTSRRInfo: Failed to retrieve Scrambling Code\n"},
};

// The mean in dBm of the samples that are not 0; without one it is not a number.
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

}  // namespace

constinit const PacketHandlers<UMTSRRInfo> UMTSRRInfo::handlers = {
    {stateLogCode, stateSize, &UMTSRRInfo::updateState},
    {transmitPowerLogCode, transmitPowerSize, &UMTSRRInfo::updateTransmitPower},
    {servingCellLogCode, servingCellSize, &UMTSRRInfo::updateServingCell},
    {cipheringLogCode, cipheringSize, &UMTSRRInfo::updateCiphering},
    {cellMonitorLogCode, 0, &UMTSRRInfo::updateFromCellMonitor},
};

void UMTSRRInfo::listNumberFormats(SectionFormats& formats) const {
  formats.add(transmitPowerRow, transmitPower);
}

void UMTSRRInfo::updateState(const Packet& packet) { setFields(rows(), packet, state); }

void UMTSRRInfo::updateTransmitPower(const Packet& packet) {
  // Kept: " nan dBm" when there is nothing to take the mean of.
  setReal(rows(), transmitPowerRow, transmitPower, meanTransmitPower(packet));
}

void UMTSRRInfo::updateServingCell(const Packet& packet) {
  setFields(rows(), packet, cellAndChannels);
  // The cell monitor alone writes this row; the modem has just said the channels itself.
  rows().remove(channelRow);
  setFields(rows(), packet, registrationArea);
}

void UMTSRRInfo::updateCiphering(const Packet& packet) { setFields(rows(), packet, ciphering); }

void UMTSRRInfo::updateFromCellMonitor(const Packet& packet) {
  const Array* records = _cellMonitor.read(packet);
  if (!records) return;
  const Dictionary* cell = firstCellOfKind(*records, cellMonitor::umts, cellMonitor::serving);
  if (cell) showCellMonitorRows(rows(), *cell, cellMonitorRows);
}

}  // namespace varnel
