#include "programs/varnel-telephonyd/simulation/LTEMeasurement.h"

#include <algorithm>

namespace varnel::simulation {

namespace {

constexpr std::int64_t thermalNoise_cdbm = -125'00;  // in one subcarrier
constexpr std::int64_t sixBlocks_cdb = 7'78;
// The quality of a cell that is alone on its carrier and has little traffic.
constexpr std::int64_t bestRSRQ_cdb = -4'00;
constexpr std::int64_t measurementNoise_cdb = 60;

// How much the stronger of two powers grows when the weaker one is added, by their difference in decibels.
constexpr std::int64_t gains_cdb[] = {301, 254, 212, 176, 146, 119, 97, 79, 64, 51,
                                      41,  33,  27,  21,  17,  14,  11, 9,  7,  5};

std::int64_t powerSum_cdbm(std::int64_t one, std::int64_t other) {
  const std::int64_t apart_db = (std::abs(one - other) + 50) / 100;
  return std::max(one, other) + (apart_db < std::ssize(gains_cdb) ? gains_cdb[apart_db] : 0);
}

}  // namespace

std::int64_t lteRSSI_cdbm(const Walk& walk, int channel) {
  std::int64_t sum_cdbm = thermalNoise_cdbm;
  for (const ReceivedCell& received : walk.cells(Access::LTE)) {
    if (received.cell->channel == channel) sum_cdbm = powerSum_cdbm(sum_cdbm, received.level_cdbm);
  }
  return sum_cdbm + sixBlocks_cdb - bestRSRQ_cdb;
}

std::vector<LTEMeasurement> measureLTECarrier(const Walk& walk, int channel, Random& random) {
  const std::int64_t rssi_cdbm = lteRSSI_cdbm(walk, channel);
  std::vector<LTEMeasurement> measurements;
  for (const ReceivedCell& received : walk.cells(Access::LTE)) {
    if (received.cell->channel != channel) continue;
    const std::int64_t rsrp_cdbm = received.level_cdbm, rsrq_cdb = rsrp_cdbm + sixBlocks_cdb - rssi_cdbm;
    const std::int64_t noise_cdb = random.noise(measurementNoise_cdb);
    measurements.push_back({.cell = received.cell,
                            .averageRSRP_cdbm = rsrp_cdbm,
                            .averageRSRQ_cdb = rsrq_cdb,
                            .measuredRSRP_cdbm = rsrp_cdbm + noise_cdb,
                            .measuredRSRQ_cdb = rsrq_cdb + noise_cdb,
                            .rssi_cdbm = rssi_cdbm});
  }
  return measurements;
}

}  // namespace varnel::simulation
