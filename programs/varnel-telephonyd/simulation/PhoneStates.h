#pragma once

#include "programs/varnel-telephonyd/simulation/PhoneActivity.h"

namespace varnel::simulation {

/// How the layers of a GSM phone call their states: radio resources and mobility (3GPP TS 44.018, 24.008),
/// calls (24.008, clause 5), packets (44.060).
struct PhoneStates {
  const char* name;  ///< of what the phone is busy with
  const char* radioResources;
  const char* channel;
  const char* mobility;
  const char* packetMobility;
  const char* call;
  const char* packets;
};

/// While the phone is busy with that.
const PhoneStates& phoneStates(PhoneActivity::Kind kind);

}  // namespace varnel::simulation
