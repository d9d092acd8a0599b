#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// The packets with which a GSM modem reports what the serving cell broadcasts about packet data. Cells
/// differ.

/// The place of system information 13.
Bytes gprsInformationPosition(const Situation& situation);
/// Which side measures and chooses the cells, packet flow contexts, and the priorities with access.
Bytes gprsCellOptions(const Situation& situation);
/// Timers, and the kind of access bursts.
Bytes gprsTimers(const Situation& situation);
/// Whether there is a separate broadcast channel for packet data.
Bytes gprsPacketBroadcastChannel(const Situation& situation);
/// The messages that carry the information, how often it has changed, and the measurement order.
Bytes gprsSystemInformation(const Situation& situation);

}  // namespace varnel::simulation
