#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/GSMConnection.h"
#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// The packets with which a GSM modem reports its serving cell, the cells around it, and the channel of a
/// call.

Bytes gsmConnectionState(const Situation& situation, const GSMConnection& connection);

Bytes gsmServingCell(const Situation& situation);
/// The serving cell with its selection criteria, or in a call with its quality; then its neighbors.
Bytes gsmMeasurements(const Situation& situation, const GSMConnection& connection);
/// The identity codes of those neighbors that are strong enough.
Bytes gsmNeighborIdentities(const Situation& situation);

/// The channels over which a call hops, its current channel, and whether it sends nothing between words.
Bytes gsmMobileAllocation(const Situation& situation);
Bytes gsmDedicatedChannel(const Situation& situation, Random& random);
Bytes gsmDiscontinuousTransmission(const Situation& situation, Random& random);

}  // namespace varnel::simulation
