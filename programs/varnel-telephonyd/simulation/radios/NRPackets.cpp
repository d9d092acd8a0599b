#include "programs/varnel-telephonyd/simulation/radios/NRPackets.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/radios/FrameClock.h"
#include "programs/varnel-telephonyd/simulation/radios/NRMessagePackets.h"
#include "programs/varnel-telephonyd/simulation/radios/PackedNetwork.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t masterInformationCode = 0xB822, servingCellCode = 0xB823, measurementsCode = 0xB97F,
                        registrationCode = 0xB80C;

constexpr int spacing30kHz = 1, bandwidthInMegahertz = 60;
constexpr int noServingCell = 65535, noBeam = 65535;
constexpr std::int64_t weakest_cdbm = -118'00, noise_cdb = 50, secondAntennaLoss_cdb = 1'40;
constexpr std::size_t mostCells = 4;

constexpr std::int64_t version(int major, int minor) { return std::int64_t{major} << 16 | minor; }

// The better a cell stands out of the noise, the better its quality, up to -10.5 dB.
std::int64_t quality_cdb(std::int64_t rsrp_cdbm) {
  return std::clamp<std::int64_t>(-10'50 - std::max<std::int64_t>(-95'00 - rsrp_cdbm, 0) / 2, -25'00, -10'50);
}
constexpr std::int64_t in128ths(std::int64_t level_cdb) { return level_cdb * 128 / 100; }

// Which of the beams that a cell sends in turn is the best one for the phone.
std::int64_t beamOf(const Cell& cell) { return cell.code % 8; }

// The place of a value in the record of a beam.
struct BeamLayout {
  std::size_t size, rsrq, filtered;  // no place for the quality: 0
};
constexpr BeamLayout shortBeam{44, 0, 28}, longBeam{84, 28, 68};

void putBeam(PacketWriter& packet, const BeamLayout& layout, const NRMeasurement& cell) {
  packet.record(layout.size)
      .u16(0, beamOf(*cell.cell))
      .u16(4, 3)
      .u16(6, noBeam)
      .u64(12, cell.cell->identity)
      .u32(20, cell.antennas[0])
      .u32(24, cell.antennas[1]);
  if (layout.rsrq != 0)
    packet.u32(layout.rsrq, cell.rsrq).u32(layout.rsrq + 4, cell.rsrq - in128ths(secondAntennaLoss_cdb));
  for (std::size_t filter = 0; filter < 2; ++filter)
    packet.u32(layout.filtered + 8 * filter, cell.filteredRSRP)
        .u32(layout.filtered + 8 * filter + 4, cell.filteredRSRQ);
}

void putCells(PacketWriter& packet, const BeamLayout& beam, std::chrono::milliseconds now,
              std::span<const NRMeasurement> cells) {
  constexpr std::size_t cellSize = 16;
  for (const NRMeasurement& cell : cells) {
    packet.record(cellSize)
        .u16(0, cell.cell->code)
        .u16(2, FrameClock(*cell.cell, now).frame)
        .u8(4, 1)  // one beam
        .u32(8, cell.rsrp)
        .u32(12, cell.rsrq);
    putBeam(packet, beam, cell);
  }
}

void putNetwork(PacketWriter& packet, std::size_t offset, const Network& network) {
  for (const std::uint8_t byte : packedNetwork(network)) packet.u8(offset++, byte);
}

}  // namespace

std::vector<NRMeasurement> measureNRCells(const Walk& walk, Random& random) {
  std::vector<NRMeasurement> cells;
  for (const auto& [cell, level_cdbm] : walk.cells(Access::NR)) {
    if (level_cdbm < weakest_cdbm || cells.size() == mostCells) break;
    const std::int64_t first_cdbm = level_cdbm + random.noise(noise_cdb),
                       second_cdbm = level_cdbm - secondAntennaLoss_cdb + random.noise(noise_cdb),
                       best_cdbm = std::max(first_cdbm, second_cdbm);
    cells.push_back({.cell = cell,
                     .antennas = {in128ths(first_cdbm), in128ths(second_cdbm)},
                     .rsrp = in128ths(best_cdbm),
                     .rsrq = in128ths(quality_cdb(best_cdbm)),
                     .filteredRSRP = in128ths(level_cdbm),
                     .filteredRSRQ = in128ths(quality_cdb(level_cdbm))});
  }
  return cells;
}

Bytes nrMasterInformation(std::chrono::milliseconds now, const Cell& cell, NRMasterInformationLayout layout) {
  const bool isOld = layout == NRMasterInformationLayout::Version3;
  constexpr std::size_t oldSize = 27, newSize = 28;
  return PacketWriter(masterInformationCode, now, isOld ? oldSize : newSize)
      .u32(13, isOld ? 3 : version(2, 0))
      .u16(17, cell.code)
      .u32(19, cell.channel)
      .bits(23, 0, 10, FrameClock(cell, now).frame)
      .bits(23, isOld ? 30 : 31, 2, spacing30kHz)
      .finish();
}

Bytes nrServingCell(std::chrono::milliseconds now, const Cell& cell, NRServingCellLayout layout) {
  const bool isOld = layout == NRServingCellLayout::Version4;
  constexpr std::size_t oldSize = 51, newSize = 62;
  PacketWriter packet(servingCellCode, now, isOld ? oldSize : newSize);
  packet.u32(13, isOld ? 4 : version(3, 2));
  const std::size_t identity = isOld ? 17 : 20, rest = isOld ? 19 : 30;
  packet.u16(identity, cell.code);
  if (!isOld) packet.u64(identity + 2, globalIdentity(cell));
  return packet.u32(rest, cell.channel)
      .u32(rest + 4, cell.channel)  // both directions share the carrier
      .u16(rest + 8, bandwidthInMegahertz)
      .u16(rest + 10, bandwidthInMegahertz)
      .u64(rest + 12, cell.identity)
      .u16(rest + 20, cell.network.countryCode)
      .u8(rest + 22, cell.network.networkCodeDigits)
      .u16(rest + 23, cell.network.networkCode)
      .u8(rest + 25, 0)  // full access
      .u32(rest + 26, cell.area)
      .u16(rest + 30, cell.band)
      .finish();
}

Bytes nrMeasurements(std::chrono::milliseconds now, std::span<const NRMeasurement> cells, const Cell* serving,
                     NRMeasurementLayout layout) {
  constexpr std::size_t headSize = 33, oldLayerSize = 32, newLayerSize = 40;
  constexpr std::int64_t periodOf20Milliseconds = 20;
  const bool isOld = layout == NRMeasurementLayout::Version2Minor9;
  const auto count = std::ssize(cells);
  const std::int64_t servingCode = serving ? serving->code : noServingCell;
  const auto found =
      std::ranges::find_if(cells, [&](const NRMeasurement& cell) { return cell.cell == serving; });
  const std::int64_t servingIndex = found == cells.end() ? 0xFF : found - cells.begin();
  const NRMeasurement& best = cells.front();

  PacketWriter packet(measurementsCode, now, headSize);
  packet.u32(13, isOld ? version(2, 9) : version(3, 0)).u8(21, 1).u8(22, periodOf20Milliseconds);
  PacketWriter& layer = packet.record(isOld ? oldLayerSize : newLayerSize).u32(0, best.cell->channel);
  if (isOld)
    layer.u8(4, count).u8(5, servingIndex).u16(6, servingCode).u8(8, beamOf(*best.cell));
  else
    layer.u8(4, 0).u8(5, count).u16(6, servingCode).u8(8, servingIndex).u8(9, beamOf(*best.cell));
  layer.u32(12, best.antennas[0]).u32(16, best.antennas[1]);
  putCells(packet, isOld ? shortBeam : longBeam, now, cells);
  return packet.finish();
}

Bytes nrRegistration(const Situation& situation, FiveGMMState state, const TemporaryName& name,
                     NRRegistrationLayout layout) {
  const bool isOld = layout == NRRegistrationLayout::Version1;
  constexpr std::size_t oldSize = 39, newSize = 40;
  constexpr std::int64_t globallyUnique = 2;
  const bool isRegistered = state == FiveGMMState::Registered;
  const Cell& cell = situation.serving;
  PacketWriter packet(registrationCode, situation.now, isOld ? oldSize : newSize);
  packet.u32(13, isOld ? 1 : version(3, 0)).u8(17, static_cast<std::int64_t>(state)).u16(18, 0);
  putNetwork(packet, 20, cell.network);
  putNetwork(packet, 24, name.network);
  return packet.u8(23, globallyUnique)
      .u8(27, name.group >> 10)
      .u16(28, name.group & 0x3FF)
      .u8(30, name.code)
      .u32(31, name.number)
      .u8(35, isRegistered ? 0 : 1)
      .u8(36, cell.area >> 16)  // the highest byte comes first
      .u8(37, cell.area >> 8)
      .u8(38, cell.area)
      .finish();
}

}  // namespace varnel::simulation
