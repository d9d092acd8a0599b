#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"
#include "programs/varnel-telephonyd/simulation/UTRANConnection.h"

namespace varnel::simulation {

/// The packets with which a UMTS modem reports its serving cell and the cells around it.

/// Its identity, its channels, and its registration area.
Bytes umtsServingCell(const Situation& situation);

/// The cells of the carrier and their sets. On a dedicated channel several cells can be active, otherwise
/// only the serving cell is.
Bytes umtsCellSets(const Situation& situation, UTRANConnection::State state, Random& random);

/// The UMTS cells in the order in which the phone would choose them.
Bytes umtsRanking(const Situation& situation);

/// The GSM cells in that order. They have separate packets, since the records of both kinds begin at the same
/// place.
Bytes gsmRanking(const Situation& situation);

}  // namespace varnel::simulation
