#pragma once

#include <cstdint>

namespace varnel::simulation {

/// Levels are sent in sixteenths of a decibel.
constexpr std::int64_t perDecibel = 16;

// Levels as the fields of a packet have them: in sixteenths of a decibel above the lowest one that the field
// can tell.
constexpr std::int64_t rsrpField(std::int64_t rsrp) { return rsrp + 180 * perDecibel; }
constexpr std::int64_t rsrqField(std::int64_t rsrq) { return rsrq + 30 * perDecibel; }
constexpr std::int64_t rssiField(std::int64_t rssi) { return rssi + 110 * perDecibel; }
/// Some layouts send the RSRP of all antennas together on another scale.
constexpr std::int64_t combinedRSRPField(std::int64_t rsrp) { return rsrp + 140 * perDecibel; }
/// In tenths of a decibel.
constexpr std::int64_t snrField(std::int64_t snrTenths) { return snrTenths + 200; }

}  // namespace varnel::simulation
