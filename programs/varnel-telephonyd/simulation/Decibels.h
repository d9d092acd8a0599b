#pragma once

#include <cstdint>

namespace varnel::simulation {

/// The power of a level in attowatts. Powers of several masts can be added. A level below -150 dBm counts as
/// -150 dBm, a level above 0 dBm as 0 dBm.
std::int64_t power_aw(std::int64_t level_cdbm);

/// The level of a power, correct to one or two hundredths of a decibel; -150 dBm for less than one attowatt.
/// The power is at most 10^15 attowatts, one milliwatt.
std::int64_t level_cdbm(std::int64_t power_aw);

}  // namespace varnel::simulation
