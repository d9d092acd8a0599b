#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// What a network serves a phone with. Numbered as in the packets.
enum class Service { None, CircuitsOnly, PacketsOnly, CircuitsAndPackets, Limited };

/// The network, area and service of the serving cell.
Bytes servingNetwork(const Situation& situation, Service service);

/// The networks that the serving one counts as its equals; none before the phone is registered.
Bytes equivalentNetworks(const Situation& situation, bool isRegistered);

}  // namespace varnel::simulation
