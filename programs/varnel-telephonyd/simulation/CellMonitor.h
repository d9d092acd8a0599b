#pragma once

#include "base/Value.h"
#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// The telephony server's list of cells: the serving one, then its strongest neighbours of every technology.
/// Neighbours of another technology are fewer.
Value cellMonitorRecords(const Walk& walk, const Cell& serving);

}  // namespace varnel::simulation
