#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// The service that a network gives to a phone. The numbers are those of the packets.
enum class Service { None, CircuitsOnly, PacketsOnly, CircuitsAndPackets, Limited };

/// The network, the area, and the service of the serving cell.
Bytes servingNetwork(const Situation& situation, Service service);

/// The networks that the serving network treats as equivalent; none before the phone is registered.
Bytes equivalentNetworks(const Situation& situation, bool isRegistered);

}  // namespace varnel::simulation
