#pragma once

#include <span>
#include <vector>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"
#include "programs/varnel-telephonyd/simulation/radios/TemporaryName.h"

namespace varnel::simulation {

/// An NR cell as a phone measures it on two antennas: the level in 128ths of a decibel, in which packets send
/// levels.
struct NRMeasurement {
  const Cell* cell;
  std::int64_t antennas[2];
  std::int64_t rsrp, rsrq;  ///< of the better antenna
  std::int64_t filteredRSRP, filteredRSRQ;
};

/// The NR cells that are strong enough, the strongest first.
std::vector<NRMeasurement> measureNRCells(const Walk& walk, Random& random);

/// 0xB822, in its two layouts: what the master information block of a cell says.
enum class NRMasterInformationLayout { Version3, Version2Minor0 };
Bytes nrMasterInformation(std::chrono::milliseconds now, const Cell& cell, NRMasterInformationLayout layout);

/// 0xB823: the identity of a cell, its channels, and its network.
enum class NRServingCellLayout { Version4, Version3Minor2 };
Bytes nrServingCell(std::chrono::milliseconds now, const Cell& cell, NRServingCellLayout layout);

/// 0xB97F: the measured cells of one carrier with a beam each. Without a serving cell there is none of NR.
enum class NRMeasurementLayout { Version2Minor9, Version3Minor0 };
Bytes nrMeasurements(std::chrono::milliseconds now, std::span<const NRMeasurement> cells, const Cell* serving,
                     NRMeasurementLayout layout);

/// TS 24.501 5.1.3.2, numbered as in the packets.
enum class FiveGMMState { Deregistered = 1, Registering = 2, Registered = 3 };
/// 0xB80C, in its two layouts.
enum class NRRegistrationLayout { Version1, Version3Minor0 };
Bytes nrRegistration(const Situation& situation, FiveGMMState state, const TemporaryName& name,
                     NRRegistrationLayout layout);

}  // namespace varnel::simulation
