#pragma once

#include "programs/varnel-telephonyd/simulation/PhoneActivity.h"

namespace varnel::simulation {

/// The states of a GSM phone's protocol layers: radio resources and mobility (3GPP TS 44.018, 24.008), calls
/// (24.008, clause 5), and packets (44.060).
struct PhoneStates {
  const char* name;  ///< the name of the activity
  const char* radioResources;
  const char* channel;
  const char* mobility;
  const char* packetMobility;
  const char* call;
  const char* packets;
};

/// The states during this activity.
const PhoneStates& phoneStates(PhoneActivity::Kind kind);

}  // namespace varnel::simulation
