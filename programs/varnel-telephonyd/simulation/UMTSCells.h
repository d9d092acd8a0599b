#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"
#include "programs/varnel-telephonyd/simulation/UTRANConnection.h"

namespace varnel::simulation {

/// The packets in which a UMTS modem tells its serving cell and the cells around.

/// Its identity, channels and registration area.
Bytes umtsServingCell(const Situation& situation);

/// The cells of the carrier and the sets that they belong to: on a dedicated channel several cells may be
/// active, else the serving one alone.
Bytes umtsCellSets(const Situation& situation, UTRANConnection::State state, Random& random);

/// The UMTS cells in the order in which the phone would choose them.
Bytes umtsRanking(const Situation& situation);

/// The GSM cells in that order. They have packets of their own, for the records of both kinds begin at the
/// same place.
Bytes gsmRanking(const Situation& situation);

}  // namespace varnel::simulation
