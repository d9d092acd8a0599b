#pragma once

#include <cstdint>

namespace varnel::simulation {

// Levels as the fields of a packet have them: in sixteenths of a decibel above the lowest one that the field
// can tell.
constexpr std::int64_t rsrpField(std::int64_t rsrp) { return rsrp + 180 * 16; }
constexpr std::int64_t rsrqField(std::int64_t rsrq) { return rsrq + 30 * 16; }
constexpr std::int64_t rssiField(std::int64_t rssi) { return rssi + 110 * 16; }
/// Some layouts send the RSRP of all antennas together on another scale.
constexpr std::int64_t combinedRSRPField(std::int64_t rsrp) { return rsrp + 140 * 16; }
/// In tenths of a decibel.
constexpr std::int64_t snrField(std::int64_t snr_tenths) { return snr_tenths + 200; }

}  // namespace varnel::simulation
