#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/radios/TemporaryName.h"

/// Messages between an LTE phone and its network: mobility management and session management (TS 24.301 8).
namespace varnel::simulation::lteNAS {

// Mobility management.
Bytes attachRequest(const TemporaryName& name);
Bytes attachAccept(const TemporaryName& name, int area);
Bytes attachComplete();
Bytes authenticationRequest(std::uint64_t challenge);
Bytes authenticationResponse(std::uint64_t challenge);
Bytes securityModeCommand();
Bytes securityModeComplete();
Bytes areaUpdateRequest(const TemporaryName& name);
Bytes areaUpdateAccept();
Bytes areaUpdateComplete();
Bytes serviceRequest(int sequence);
/// The message as it goes over the air: behind an authentication code and its number.
Bytes integrityProtected(ByteView message, int sequence);

// Session management.
Bytes connectivityRequest();
Bytes activateDefaultBearerRequest();
Bytes activateDefaultBearerAccept();
Bytes activateDedicatedBearerRequest(int guaranteedRateCode);
Bytes activateDedicatedBearerAccept();
Bytes deactivateBearerRequest();
Bytes deactivateBearerAccept();

}  // namespace varnel::simulation::lteNAS
