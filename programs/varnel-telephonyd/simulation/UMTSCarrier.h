#pragma once

#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// The power on the carrier that all UMTS cells of the town share.
std::int64_t umtsRSSI_cdbm(const Walk& walk);

/// A UMTS cell's share of the carrier's power. Beside a strong cell, a weak one is lost.
std::int64_t umtsEcN0_cdb(const Walk& walk, const Cell& cell);

/// The same as an energy. 524,288 stands for the whole carrier.
std::int64_t umtsEnergy(std::int64_t ecN0_cdb);

}  // namespace varnel::simulation
