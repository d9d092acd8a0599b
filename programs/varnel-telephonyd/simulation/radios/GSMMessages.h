#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Cell.h"

/// Messages of GSM: radio resources (TS 44.018 9.1), and between the phone and its network (TS 24.008 9).
namespace varnel::simulation::gsmMessages {

/// Broadcast: the cell and its area. Filled up to 23 bytes, as all broadcast messages are.
Bytes systemInformation3(const Cell& cell);
/// Pages nobody, as most of the time.
Bytes emptyPaging();
Bytes channelRelease();

Bytes locationUpdateRequest(const Cell& cell, std::uint32_t temporaryIdentity);
Bytes locationUpdateAccept(const Cell& cell);
Bytes serviceRequest(std::uint32_t temporaryIdentity);
Bytes serviceAccept();

}  // namespace varnel::simulation::gsmMessages
