#include "programs/varnel-telephonyd/simulation/CDMACarrier.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/Decibels.h"

namespace varnel::simulation {

namespace {

constexpr std::int64_t noise_cdbm = -106'00;  // in 1.23 MHz
// Even below a mast no receiver is perfect: a twentieth of the received power disturbs the rest.
constexpr std::int64_t imperfection = 20;
constexpr std::int64_t pilotPartOf1x = 5;  // a fifth of the power
// 3GPP2 C.S0011, for the band class of 800 MHz.
constexpr std::int64_t openLoopSum_cdbm = -73'00;

}  // namespace

std::int64_t CDMACarrier::strength(const Cell& cell) const {
  return std::ranges::find(pilots, &cell, &ReceivedPilot::cell)->strength;
}

CDMACarrier receiveCDMACarrier(const Walk& walk, Access access) {
  const std::int64_t pilotPart = access == Access::CDMA1xRTT ? pilotPartOf1x : 1;
  const auto cells = walk.cells(cdmaMasts);
  std::int64_t total_aw = power_aw(noise_cdbm) + power_aw(cells.front().level_cdbm) / imperfection;
  for (const ReceivedCell& received : cells) total_aw += power_aw(received.level_cdbm);
  CDMACarrier carrier{{}, level_cdbm(total_aw)};
  for (const auto& [cell, level] : cells)
    carrier.pilots.push_back({cell, power_aw(level) * ReceivedPilot::whole / (total_aw * pilotPart)});
  return carrier;
}

std::int64_t openLoopPower_cdbm(std::int64_t level_cdbm) {
  return std::clamp(openLoopSum_cdbm - level_cdbm, leastTransmitPower_cdbm, mostTransmitPower_cdbm);
}

std::int64_t strength_cdb(std::int64_t strength) {
  return level_cdbm(strength) - level_cdbm(ReceivedPilot::whole);
}

}  // namespace varnel::simulation
