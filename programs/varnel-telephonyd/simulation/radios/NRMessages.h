#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/radios/TemporaryName.h"

/// Messages of NR: radio resource control (TS 38.331 6.2), and between the phone and its network (TS 24.501
/// 8).
namespace varnel::simulation::nrMessages {

Bytes masterInformation(std::int64_t frame);

/// NR cells that join an LTE connection, as LTE carries them: without a channel's message around them.
Bytes reconfiguration();
Bytes reconfigurationComplete();
/// The level and quality of a serving cell, in 128ths of a decibel.
Bytes measurementReport(const Cell& cell, std::int64_t rsrp, std::int64_t rsrq);

Bytes setupRequest(const TemporaryName& name);
Bytes setup();
Bytes setupComplete(ByteView message);
Bytes release();

Bytes registrationRequest(const TemporaryName& name);
Bytes registrationAccept();
Bytes registrationComplete();
Bytes sessionRequest();
Bytes sessionAccept();

}  // namespace varnel::simulation::nrMessages
