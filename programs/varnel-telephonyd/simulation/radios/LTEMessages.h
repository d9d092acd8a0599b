#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/radios/TemporaryName.h"

/// Messages of the radio resource control of LTE (TS 36.331 6.2).
namespace varnel::simulation::lteMessages {

/// TS 36.331 6.2.2, numbered as in the message.
enum class Cause { MobileTerminated = 2, Signaling = 3, Data = 4 };

// From the network to all phones.
Bytes systemInformationBlock1(const Cell& cell);
Bytes paging(const TemporaryName& name);

// From the network to the phone.
Bytes connectionSetup();
Bytes securityModeCommand();
Bytes connectionReconfiguration();
Bytes downlinkInformationTransfer(ByteView message);
Bytes connectionRelease();
/// The phone shall go on to this UMTS channel.
Bytes connectionReleaseToUMTS(int channel);

// From the phone to the network.
Bytes connectionRequest(const TemporaryName& name, Cause cause);
Bytes connectionSetupComplete(ByteView message);
Bytes securityModeComplete();
Bytes connectionReconfigurationComplete();
Bytes uplinkInformationTransfer(ByteView message);
/// In sixteenths of a decibel.
Bytes measurementReport(std::int64_t rsrp, std::int64_t rsrq);

}  // namespace varnel::simulation::lteMessages
