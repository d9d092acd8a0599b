#pragma once

#include "base/Value.h"
#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// The telephony server's list of cells: the serving cell unless the server does not know its technology,
/// then its strongest neighbors in every technology. There are fewer neighbors of another technology.
Value cellMonitorRecords(const Walk& walk, const Cell& serving);

}  // namespace varnel::simulation
