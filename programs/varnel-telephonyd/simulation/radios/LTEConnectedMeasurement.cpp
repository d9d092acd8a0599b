#include "programs/varnel-telephonyd/simulation/radios/LTEConnectedMeasurement.h"

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/radios/FrameClock.h"
#include "programs/varnel-telephonyd/simulation/radios/LevelFields.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t measurementCode = 0xB179, neighborsCode = 0xB195;
constexpr int firstTimeDivisionChannel = 36000;

}  // namespace

Bytes lteConnectedMeasurement(std::chrono::milliseconds now, std::span<const AntennaLevels> cells,
                              std::span<const Cell* const> detected, int servingIndex, ChannelWidth width) {
  constexpr std::size_t narrowHead = 37, wideHead = 41, neighborSize = 12, detectedSize = 16;
  const bool isWide = width == ChannelWidth::Bits32;
  const AntennaLevels& serving = cells.front();
  const FrameClock clock(*serving.cell, now);
  PacketWriter packet(measurementCode, now, isWide ? wideHead : narrowHead);
  packet.u8(13, isWide ? 4 : 3).bits(17, 0, 3, servingIndex);
  if (isWide)
    packet.u32(21, serving.cell->channel);
  else
    packet.u16(21, serving.cell->channel);
  const std::size_t rest = isWide ? 25 : 23;
  packet.u16(rest, serving.cell->code)
      .u16(rest + 2, 10 * clock.frame + clock.subframe)
      .u16(rest + 4, rsrpField(serving.filtered.rsrp))
      .u16(rest + 6, rsrpField(serving.filtered.rsrp))
      .u16(rest + 8, rsrqField(serving.filtered.rsrq))
      .u16(rest + 10, rsrqField(serving.filtered.rsrq))
      .u8(rest + 12, std::ssize(cells) - 1)
      .u8(rest + 13, std::ssize(detected));
  for (const AntennaLevels& neighbor : cells.subspan(1))
    packet.record(neighborSize)
        .u16(0, neighbor.cell->code)
        .u16(2, rsrpField(neighbor.filtered.rsrp))
        .u16(4, rsrpField(neighbor.filtered.rsrp))
        .u16(6, rsrqField(neighbor.filtered.rsrq))
        .u16(8, rsrqField(neighbor.filtered.rsrq));
  for (const Cell* cell : detected) {
    const FrameClock itsClock(*cell, now);
    packet.record(detectedSize)
        .u16(0, cell->code)
        .u32(4, 120)  // the correlation of its synchronization signal
        .u64(8, 10 * itsClock.frame + itsClock.subframe);
  }
  return packet.finish();
}

Bytes lteConnectedNeighbors(std::chrono::milliseconds now, std::span<const AntennaLevels> cells,
                            int servingIndex, ConnectedNeighborsLayout layout) {
  constexpr std::size_t headSize = 17, narrowHead = 8, wideHead = 12, cellSize = 52;
  constexpr int resultID = 31, versions[] = {3, 4, 24};
  const bool isNarrow = layout == ConnectedNeighborsLayout::Version3;
  const std::size_t subpacketHead = isNarrow ? narrowHead : wideHead, counts = isNarrow ? 6 : 8;
  const Cell& serving = *cells.front().cell;
  const auto neighbors = cells.subspan(1);
  PacketWriter packet(neighborsCode, now, headSize);
  packet.u8(13, 1).u8(14, 1);  // version, subpackets
  packet.record(subpacketHead)
      .u8(0, resultID)
      .u8(1, versions[static_cast<std::size_t>(layout)])
      .u16(2, static_cast<std::int64_t>(subpacketHead + cellSize * neighbors.size()))
      .bits(4, 0, isNarrow ? 16 : 32, serving.channel)
      .bits(counts, 0, 6, std::ssize(neighbors))
      .bits(counts, 7, 2, serving.channel >= firstTimeDivisionChannel)
      .bits(counts, 9, 4, servingIndex);
  // The packet has room for two antennas.
  for (const AntennaLevels& neighbor : neighbors) {
    const AntennaLevel &first = neighbor.antennas[0], &second = neighbor.antennas[1];
    PacketWriter& record = packet.record(cellSize);
    record.bits(0, 0, 10, neighbor.cell->code).bits(0, 10, 16, neighbor.cell->identity & 0xFF);
    std::size_t word = 4;
    for (const std::int64_t rsrp : {first.rsrp, second.rsrp, neighbor.combined.rsrp}) {
      record.bits(word, 0, 12, rsrpField(rsrp)).bits(word, 12, 12, rsrpField(rsrp));
      word += 4;
    }
    record.bits(16, 0, 10, rsrqField(first.rsrq))
        .bits(16, 20, 10, rsrqField(second.rsrq))
        .bits(20, 10, 10, rsrqField(neighbor.combined.rsrq))
        .bits(24, 0, 11, rssiField(first.rssi))
        .bits(28, 0, 11, rssiField(second.rssi))
        .bits(28, 11, 11, rssiField(neighbor.combined.rssi));
  }
  return packet.finish();
}

}  // namespace varnel::simulation
