#pragma once

#include "base/Bytes.h"

/// Messages of the radio resource control of UMTS (TS 25.331 10.2).
namespace varnel::simulation::umtsMessages {

/// A call for a phone that the network knows by this name.
Bytes paging(std::uint32_t temporaryIdentity);
Bytes connectionRequest(std::uint32_t temporaryIdentity, int countryCode, int networkCode, int area);
Bytes connectionReleaseComplete();

}  // namespace varnel::simulation::umtsMessages
