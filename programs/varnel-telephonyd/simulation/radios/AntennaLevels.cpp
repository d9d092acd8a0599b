#include "programs/varnel-telephonyd/simulation/radios/AntennaLevels.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/LTEMeasurement.h"
#include "programs/varnel-telephonyd/simulation/radios/LevelFields.h"

namespace varnel::simulation {

namespace {

constexpr std::int64_t lowestRSRQ = -30 * perDecibel;
constexpr std::int64_t antennaLoss_cdb[] = {0, 1'20, 2'10, 2'90};
constexpr std::int64_t fastNoise_cdb = 40, totalNoise_cdb = 15;

// 10 lg of the number of resource blocks, in sixteenths of a decibel.
std::int64_t blocksInSixteenths(int resourceBlocks) {
  switch (resourceBlocks) {
    case 6:
      return 125;
    case 15:
      return 188;
    case 25:
      return 224;
    case 50:
      return 272;
    case 75:
      return 300;
    default:
      return 320;  // 100
  }
}

constexpr std::int64_t sixteenths(std::int64_t level_cdb) { return level_cdb * 16 / 100; }

AntennaLevel level(std::int64_t rsrp, std::int64_t rssi, int resourceBlocks) {
  const std::int64_t rsrq = std::max(blocksInSixteenths(resourceBlocks) + rsrp - rssi, lowestRSRQ);
  // A cell that is alone has -4 dB of quality; one as strong as all others together, about -13 dB.
  constexpr std::int64_t evenRSRQ = -13 * perDecibel, weakestTenths = -190, strongestTenths = 300;
  const std::int64_t snrTenths = (rsrq - evenRSRQ) * 20 / 16;
  return {rsrp, rsrq, rssi, std::clamp(snrTenths, weakestTenths, strongestTenths)};
}

}  // namespace

AntennaLevels measureOnAntennas(const Walk& walk, const Cell& cell, int antennas, Random& random) {
  const std::int64_t rsrp_cdbm = walk.level_cdbm(cell);
  // The power over six resource blocks, carried over to the width of the cell.
  const std::int64_t wider_cdb = (blocksInSixteenths(cell.resourceBlocks) - blocksInSixteenths(6)) * 100 / 16;
  const std::int64_t rssi_cdbm = lteRSSI_cdbm(walk, cell.channel) + wider_cdb;
  AntennaLevels levels{.cell = &cell, .antennas = {}, .combined = {}, .filtered = {}};
  for (int antenna = 0; antenna < antennas; ++antenna) {
    const std::int64_t loss_cdb = antennaLoss_cdb[antenna];
    levels.antennas.push_back(level(sixteenths(rsrp_cdbm - loss_cdb + random.noise(fastNoise_cdb)),
                                    sixteenths(rssi_cdbm - loss_cdb + random.noise(totalNoise_cdb)),
                                    cell.resourceBlocks));
  }
  levels.combined = levels.antennas.front();
  for (const AntennaLevel& antenna : levels.antennas) {
    levels.combined.rsrp = std::max(levels.combined.rsrp, antenna.rsrp);
    levels.combined.rsrq = std::max(levels.combined.rsrq, antenna.rsrq);
    levels.combined.rssi = std::max(levels.combined.rssi, antenna.rssi);
    levels.combined.snrTenths = std::max(levels.combined.snrTenths, antenna.snrTenths);
  }
  levels.filtered = level(sixteenths(rsrp_cdbm), sixteenths(rssi_cdbm), cell.resourceBlocks);
  return levels;
}

std::vector<AntennaLevels> measureCarrierOnAntennas(const Walk& walk, const Cell& serving, int antennas,
                                                    std::size_t most, Random& random) {
  std::vector<AntennaLevels> cells{measureOnAntennas(walk, serving, antennas, random)};
  for (const LTEMeasurement& measurement : measureLTECarrier(walk, serving.channel, random)) {
    if (measurement.cell == &serving || !measurement.isMeasurable()) continue;
    if (cells.size() == most) break;
    cells.push_back(measureOnAntennas(walk, *measurement.cell, antennas, random));
  }
  return cells;
}

}  // namespace varnel::simulation
