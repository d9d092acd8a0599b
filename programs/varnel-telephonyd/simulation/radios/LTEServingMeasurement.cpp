#include "programs/varnel-telephonyd/simulation/radios/LTEServingMeasurement.h"

#include <utility>

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/radios/FrameClock.h"
#include "programs/varnel-telephonyd/simulation/radios/LevelFields.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t servingMeasurementCode = 0xB193;
constexpr int subpacketID = 25;
constexpr std::size_t headSize = 17, mostCells = 4;

// Where a field begins: a byte of the cell's record, and a bit.
struct Place {
  std::size_t byte;
  unsigned bit;
};
struct Layout {
  int version;
  std::size_t antennas, firstCell, cellSize;
  bool reservesRoom;  // for four cells, however many there are
  Place rsrp[4], rsrq[4], rssi[4], snr[4];
  Place rsrpOfAll, rsrqOfAll, rssiOfAll;
  std::int64_t (*rsrpOfAllField)(std::int64_t rsrp);
  std::size_t sir, rsrqAfterCancellation;
};
constexpr Layout version19{.version = 19,
                           .antennas = 2,
                           .firstCell = 12,
                           .cellSize = 88,
                           .reservesRoom = true,
                           .rsrp = {{16, 10}, {20, 12}},
                           .rsrq = {{28, 12}, {32, 0}},
                           .rssi = {{36, 10}, {36, 21}},
                           .snr = {{64, 0}, {64, 9}},
                           .rsrpOfAll = {24, 12},
                           .rsrqOfAll = {32, 20},
                           .rssiOfAll = {40, 0},
                           .rsrpOfAllField = rsrpField,
                           .sir = 80,
                           .rsrqAfterCancellation = 84};
constexpr Layout version36{.version = 36,
                           .antennas = 4,
                           .firstCell = 12,
                           .cellSize = 128,
                           .reservesRoom = true,
                           .rsrp = {{16, 10}, {20, 12}, {24, 12}, {28, 0}},
                           .rsrq = {{36, 0}, {36, 20}, {40, 10}, {40, 20}},
                           .rssi = {{48, 0}, {48, 11}, {52, 0}, {52, 11}},
                           .snr = {{80, 0}, {80, 9}, {84, 0}, {84, 9}},
                           .rsrpOfAll = {28, 12},
                           .rsrqOfAll = {44, 0},
                           .rssiOfAll = {56, 0},
                           .rsrpOfAllField = combinedRSRPField,
                           .sir = 104,
                           .rsrqAfterCancellation = 108};
constexpr Layout version48{.version = 48,
                           .antennas = 4,
                           .firstCell = 16,
                           .cellSize = 140,
                           .reservesRoom = false,
                           .rsrp = {{16, 10}, {20, 12}, {24, 12}, {32, 0}},
                           .rsrq = {{40, 0}, {40, 20}, {44, 10}, {44, 20}},
                           .rssi = {{52, 0}, {52, 11}, {56, 0}, {56, 11}},
                           .snr = {{92, 0}, {92, 9}, {96, 0}, {96, 9}},
                           .rsrpOfAll = {32, 12},
                           .rsrqOfAll = {48, 0},
                           .rssiOfAll = {60, 0},
                           .rsrpOfAllField = combinedRSRPField,
                           .sir = 116,
                           .rsrqAfterCancellation = 120};

const Layout& layoutOf(ServingMeasurementLayout layout) {
  switch (layout) {
    case ServingMeasurementLayout::Version19:
      return version19;
    case ServingMeasurementLayout::Version36:
      return version36;
    case ServingMeasurementLayout::Version48:
      break;
  }
  return version48;
}

constexpr unsigned rsrpWidth = 12, rsrqWidth = 10, rssiWidth = 11, snrWidth = 9;

void put(PacketWriter& record, Place place, unsigned width, std::int64_t number) {
  record.bits(place.byte, place.bit, width, number);
}

void putAntennas(PacketWriter& record, const Layout& layout, const AntennaLevels& levels) {
  for (std::size_t i = 0; i < levels.antennas.size(); ++i) {
    const AntennaLevel& antenna = levels.antennas[i];
    put(record, layout.rsrp[i], rsrpWidth, rsrpField(antenna.rsrp));
    put(record, layout.rsrq[i], rsrqWidth, rsrqField(antenna.rsrq));
    put(record, layout.rssi[i], rssiWidth, rssiField(antenna.rssi));
    put(record, layout.snr[i], snrWidth, snrField(antenna.snrTenths));
  }
}

// Newer modems also send what they have filtered, each value behind that of all antennas.
void putFiltered(PacketWriter& record, const Layout& layout, const AntennaLevel& filtered) {
  if (layout.version < 36) return;
  put(record, {layout.rsrpOfAll.byte + 4, 12}, rsrpWidth, rsrpField(filtered.rsrp));
  put(record, {layout.rsrqOfAll.byte, 20}, rsrqWidth, rsrqField(filtered.rsrq));
}

void putCell(PacketWriter& record, const Layout& layout, const AntennaLevels& levels,
             std::chrono::milliseconds now, int servingIndex, bool isServing) {
  const FrameClock clock(*levels.cell, now);
  record.bits(0, 0, 9, levels.cell->code)
      .bits(0, 9, 3, servingIndex)
      .bits(0, 12, 1, isServing)
      .bits(4, 0, 10, clock.frame)
      .bits(4, 10, 4, clock.subframe);
  putAntennas(record, layout, levels);
  putFiltered(record, layout, levels.filtered);
  // Version 19 repeats the second antenna.
  if (layout.version == 19 && levels.antennas.size() > 1)
    put(record, {layout.rsrq[1].byte, 10}, rsrqWidth, rsrqField(levels.antennas[1].rsrq));
  put(record, layout.rsrpOfAll, rsrpWidth, layout.rsrpOfAllField(levels.combined.rsrp));
  put(record, layout.rsrqOfAll, rsrqWidth, rsrqField(levels.combined.rsrq));
  put(record, layout.rssiOfAll, rssiWidth, rssiField(levels.combined.rssi));
  record.u32(layout.sir, levels.combined.snrTenths * 16 / 10)
      .u32(layout.rsrqAfterCancellation, rsrqField(levels.combined.rsrq));
}

}  // namespace

int antennasOf(ServingMeasurementLayout layout) { return static_cast<int>(layoutOf(layout).antennas); }

Bytes lteServingMeasurement(std::chrono::milliseconds now, ServingMeasurementLayout layoutName,
                            std::span<const AntennaLevels> cells, int servingIndex) {
  const Layout& layout = layoutOf(layoutName);
  const std::size_t count = std::min(cells.size(), mostCells), room = layout.reservesRoom ? mostCells : count;
  const std::size_t size = layout.firstCell + room * layout.cellSize;
  const auto antennas = cells.front().antennas.size();
  PacketWriter packet(servingMeasurementCode, now, headSize);
  packet.u8(13, 1).u8(14, 1);  // version, subpackets
  packet.record(layout.firstCell)
      .u8(0, subpacketID)
      .u8(1, layout.version)
      .u16(2, static_cast<std::int64_t>(size))
      .u32(4, cells.front().cell->channel)
      .u16(8, static_cast<std::int64_t>(count));
  if (layout.version >= 36) packet.u16(10, (1 << antennas) - 1);
  for (std::size_t i = 0; i < count; ++i)
    putCell(packet.record(layout.cellSize), layout, cells[i], now, servingIndex, i == 0);
  return packet.padTo(headSize + size).finish();
}

}  // namespace varnel::simulation
