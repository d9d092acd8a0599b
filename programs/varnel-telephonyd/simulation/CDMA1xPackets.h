#pragma once

#include <chrono>
#include <vector>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/CDMA1xConnection.h"
#include "programs/varnel-telephonyd/simulation/CDMACarrier.h"

namespace varnel::simulation {

/// What the 1x half of a CDMA phone reports about itself. Its second receiver is on the same channel.
struct CDMA1xStatus {
  CDMA1xConnection::State state;
  int bandClass, channel;
  std::int64_t level_cdbm, secondLevel_cdbm;
  std::int64_t transmitPower_cdbm;
  int referencePilot;                 ///< the offset of the pilot
  std::vector<ReceivedPilot> pilots;  ///< the active set
};

/// The system that a 1x phone has found.
struct CDMASystem {
  int roamingIndicator;  ///< 3GPP2 C.R1001
  int system, network, packetZone, protocolRevision, baseStation;
};

enum class Frame { Good, Erased };

Bytes cdma1xStatusPacket(std::chrono::milliseconds now, const CDMA1xStatus& status);
Bytes trafficFramePacket(std::chrono::milliseconds now, Frame frame);
Bytes cdmaSystemPacket(std::chrono::milliseconds now, const CDMASystem& system);

}  // namespace varnel::simulation
