#pragma once

#include "programs/varnel-telephonyd/simulation/Town.h"

namespace varnel::simulation {

/// The town with NR cells of the home network on the masts of its widest LTE carrier.
Town townOfHome(Random random);

/// The same streets and masts for a phone of the partner network, whose LTE cells have carriers of their own.
/// Both towns have as many cells.
Town townOfPartner(Random random);

}  // namespace varnel::simulation
