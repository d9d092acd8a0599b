#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// The packets with which a connected LTE modem reports its transmit power, which follows the path loss: two
/// of the shared channel, one of the control channel. Each has some records, the latest last.

Bytes lteUplinkTransmissions(const Situation& situation, Random& random);
Bytes lteSharedChannelPower(const Situation& situation, Random& random);
Bytes lteControlChannelPower(const Situation& situation, Random& random);

}  // namespace varnel::simulation
