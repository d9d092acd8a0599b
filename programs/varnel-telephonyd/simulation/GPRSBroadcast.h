#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// The packets in which a GSM modem tells what the serving cell broadcasts about packet data; one cell
/// differs from another.

/// Where system information 13 is sent.
Bytes gprsInformationPosition(const Situation& situation);
/// Who measures and chooses the cells, packet flow contexts, and which priorities may have access.
Bytes gprsCellOptions(const Situation& situation);
/// Timers and the kind of access bursts.
Bytes gprsTimers(const Situation& situation);
/// Whether there is a broadcast channel for packet data alone.
Bytes gprsPacketBroadcastChannel(const Situation& situation);
/// Which messages carry the information, how often it has changed, and the measurement order.
Bytes gprsSystemInformation(const Situation& situation);

}  // namespace varnel::simulation
