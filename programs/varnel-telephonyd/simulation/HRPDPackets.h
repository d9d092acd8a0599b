#pragma once

#include <chrono>
#include <optional>
#include <vector>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/CDMACarrier.h"
#include "programs/varnel-telephonyd/simulation/HRPDConnection.h"
#include "programs/varnel-telephonyd/simulation/HRPDTraffic.h"

namespace varnel::simulation {

/// What the HRPD half of a CDMA phone reports about itself.
struct HRPDStatus {
  HRPDConnection::State state;
  HRPDConnection::Session session;
  int bandClass, channel;
  std::int64_t level_cdbm, secondLevel_cdbm;
  std::int64_t transmitPower_cdbm;
  std::optional<int> servingPilot;  ///< the offset of the pilot
  std::int64_t address;             ///< the 24 bits of the UATI that belong to the phone
  int colorCode;
};

/// A part of the receiver that follows one path of one pilot, or currently follows none.
struct Finger {
  const Cell* cell = nullptr;
  std::int64_t carrierToInterference = 0;  ///< in 1/512
};

Bytes hrpdStatusPacket(std::chrono::milliseconds now, const HRPDStatus& status);
Bytes hrpdActiveSetPacket(std::chrono::milliseconds now, const std::vector<ReceivedPilot>& pilots);
Bytes hrpdFingersPacket(std::chrono::milliseconds now, const std::vector<Finger>& fingers);
/// Counters since the phone was switched on, and the number of seconds since then.
Bytes hrpdForwardPacket(std::chrono::milliseconds now, std::uint32_t second, const ForwardPackets& packets);
Bytes hrpdReversePacket(std::chrono::milliseconds now, std::uint32_t second, const ReversePackets& packets);

}  // namespace varnel::simulation
