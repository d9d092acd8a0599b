#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/GSMConnection.h"
#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// The packets in which a GSM modem tells its serving cell, the cells around and the channel of a call.

Bytes gsmConnectionState(const Situation& situation, const GSMConnection& connection);

Bytes gsmServingCell(const Situation& situation);
/// The serving cell, by its selection criteria or, in a call, by its quality; then its neighbours.
Bytes gsmMeasurements(const Situation& situation, const GSMConnection& connection);
/// The identity codes of those neighbours that are strong enough for it.
Bytes gsmNeighbourIdentities(const Situation& situation);

/// The channels between which a call hops, the one that it has now, and whether it falls silent between
/// words.
Bytes gsmMobileAllocation(const Situation& situation);
Bytes gsmDedicatedChannel(const Situation& situation, Random& random);
Bytes gsmDiscontinuousTransmission(const Situation& situation, Random& random);

}  // namespace varnel::simulation
