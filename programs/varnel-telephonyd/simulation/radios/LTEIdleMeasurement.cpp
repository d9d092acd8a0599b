#include "programs/varnel-telephonyd/simulation/radios/LTEIdleMeasurement.h"

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/radios/LevelFields.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t measurementCode = 0xB17F, neighborsCode = 0xB180;

// Broadcast by the network.
constexpr std::int64_t minimumLevel_dbm = -124, maximumPower_dbm = 23, priority = 5;
constexpr std::int64_t intraFrequencySearch = 29, otherSearch = 22;

// Minimum levels are sent in steps of 2 dB above -140 dBm, powers above -30 dBm, and what is left of a level
// above -50 dB.
constexpr std::int64_t minimumLevelField = (minimumLevel_dbm + 140) / 2;
constexpr std::int64_t powerField = maximumPower_dbm + 30;
std::int64_t leftField(const AntennaLevel& level) { return level.rsrp / 16 - minimumLevel_dbm + 50; }

constexpr std::int64_t noRelease9 = 0;

}  // namespace

Bytes lteIdleMeasurement(std::chrono::milliseconds now, const AntennaLevels& serving, ChannelWidth width) {
  const bool isWide = width == ChannelWidth::Bits32;
  constexpr std::size_t narrowSize = 45, wideSize = 49;
  PacketWriter packet(measurementCode, now, isWide ? wideSize : narrowSize);
  packet.u8(13, isWide ? 5 : 4).u8(14, noRelease9);
  const std::size_t cellWord = isWide ? 21 : 19, levels = isWide ? 25 : 21;
  if (isWide)
    packet.u32(17, serving.cell->channel);
  else
    packet.u16(17, serving.cell->channel);
  return packet.bits(cellWord, 0, 9, serving.cell->code)
      .bits(cellWord, 9, 7, priority)
      .bits(levels, 0, 12, rsrpField(serving.combined.rsrp))
      .bits(levels + 4, 0, 12, rsrpField(serving.filtered.rsrp))
      .bits(levels + 8, 0, 10, rsrqField(serving.combined.rsrq))
      .bits(levels + 8, 20, 10, rsrqField(serving.filtered.rsrq))
      .bits(levels + 12, 10, 11, rssiField(serving.combined.rssi))
      .bits(levels + 16, 0, 6, minimumLevelField)
      .bits(levels + 16, 6, 7, powerField)
      .bits(levels + 16, 13, 6, powerField)  // the phone's own limit
      .bits(levels + 16, 19, 7, leftField(serving.filtered))
      .bits(levels + 16, 26, 6, 0)  // no cycle without coverage
      .bits(levels + 20, 0, 6, intraFrequencySearch)
      .bits(levels + 20, 6, 6, otherSearch)
      .finish();
}

Bytes lteIdleNeighbors(std::chrono::milliseconds now, std::span<const AntennaLevels> neighbors,
                       ChannelWidth width) {
  const bool isWide = width == ChannelWidth::Bits32;
  constexpr std::size_t narrowHead = 21, wideHead = 25, cellSize = 32;
  PacketWriter packet(neighborsCode, now, isWide ? wideHead : narrowHead);
  packet.u8(13, isWide ? 5 : 4).u8(14, noRelease9);
  const int channel = neighbors.front().cell->channel;
  if (isWide)
    packet.u32(17, channel).bits(21, 0, 6, minimumLevelField).bits(21, 6, 26, std::ssize(neighbors));
  else
    packet.u16(17, channel).bits(19, 0, 6, minimumLevelField).bits(19, 6, 10, std::ssize(neighbors));
  for (const AntennaLevels& neighbor : neighbors)
    packet.record(cellSize)
        .bits(0, 0, 9, neighbor.cell->code)
        .bits(0, 9, 11, rssiField(neighbor.combined.rssi))
        .bits(0, 20, 12, rsrpField(neighbor.combined.rsrp))
        .bits(4, 12, 12, rsrpField(neighbor.filtered.rsrp))
        .bits(8, 12, 10, rsrqField(neighbor.combined.rsrq))
        .bits(12, 0, 10, rsrqField(neighbor.filtered.rsrq))
        .bits(12, 20, 6, leftField(neighbor.filtered) - 50)
        .u16(16, neighbor.cell->identity & 0xFF);
  return packet.finish();
}

}  // namespace varnel::simulation
