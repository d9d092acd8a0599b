#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"
#include "programs/varnel-telephonyd/simulation/radios/TemporaryName.h"

namespace varnel::simulation {

/// TS 24.301 5.1.3.2, numbered as in the packets.
enum class EMMState {
  Deregistered = 1,
  Registering = 2,
  Registered = 3,
  UpdatingArea = 4,
  RequestingService = 5
};

/// 0xB0EE: the state, the network, and the phone's name. Without a name the phone has not registered yet.
Bytes lteRegistration(const Situation& situation, EMMState state, int substate, const TemporaryName* name);

/// A connection for packets (TS 24.301 6.1.3.3), numbered as in the packets.
struct Bearer {
  enum class State { Inactive, ActivePending, Active, ModifyPending };
  int identity;
  int qualityClass;        ///< TS 23.203 table 6.1.7
  int guaranteedRateCode;  ///< TS 24.301 9.9.4.3; 0 for a default bearer
  bool isDedicated() const { return guaranteedRateCode != 0; }
};

/// 0xB0E5 and 0xB0E4: what the bearer gives, and its state.
Bytes lteBearerInformation(std::chrono::milliseconds now, const Bearer& bearer, Bearer::State state);
Bytes lteBearerState(std::chrono::milliseconds now, const Bearer& bearer, Bearer::State state);

}  // namespace varnel::simulation
