#include "programs/varnel-telephonyd/simulation/Decibels.h"

#include <algorithm>

namespace varnel::simulation {

namespace {

constexpr std::int64_t lowest_cdbm = -150'00, highest_cdbm = 0;  // -150 dBm is one attowatt
constexpr std::int64_t decade_cdb = 10'00, step_cdb = 1'00;
// Ten to the power of 0 dB, 1 dB, and so on up to 10 dB, in thousandths. Values between them are interpolated
// linearly.
constexpr std::int64_t ratios[] = {1000, 1259, 1585, 1995, 2512, 3162, 3981, 5012, 6310, 7943, 10000};
constexpr std::int64_t ratioUnit = 1000;

}  // namespace

std::int64_t power_aw(std::int64_t level_cdbm) {
  const std::int64_t above_cdb = std::clamp(level_cdbm, lowest_cdbm, highest_cdbm) - lowest_cdbm;
  const std::int64_t step = above_cdb % decade_cdb / step_cdb;
  std::int64_t power = ratios[step] + (ratios[step + 1] - ratios[step]) * (above_cdb % step_cdb) / step_cdb;
  for (std::int64_t decade = 0; decade < above_cdb / decade_cdb; ++decade) power *= 10;
  return power / ratioUnit;
}

std::int64_t level_cdbm(std::int64_t power_aw) {
  std::int64_t ratio = std::max<std::int64_t>(power_aw, 1) * ratioUnit, level = lowest_cdbm;
  for (; ratio >= ratios[10]; ratio /= 10) level += decade_cdb;
  std::int64_t step = 0;
  while (ratio >= ratios[step + 1]) ++step;
  return level + step * step_cdb + (ratio - ratios[step]) * step_cdb / (ratios[step + 1] - ratios[step]);
}

}  // namespace varnel::simulation
