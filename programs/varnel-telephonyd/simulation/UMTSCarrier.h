#pragma once

#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// The power on the carrier that all UMTS cells of the town share.
std::int64_t umtsRSSI_cdbm(const Walk& walk);

/// How much of the carrier's power a UMTS cell has: beside the strongest one, a weak cell drowns.
std::int64_t umtsEcN0_cdb(const Walk& walk, const Cell& cell);

/// The same as an energy in proportion to that of the whole carrier, which is 524,288.
std::int64_t umtsEnergy(std::int64_t ecN0_cdb);

}  // namespace varnel::simulation
