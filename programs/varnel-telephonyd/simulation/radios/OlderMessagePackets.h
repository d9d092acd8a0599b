#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

enum class UMTSChannel { UplinkCommon = 0, UplinkDedicated = 1, Paging = 6 };
/// 0x412F: a message of UMTS's radio resource control.
Bytes umtsMessage(std::chrono::milliseconds now, UMTSChannel channel, ByteView message);
/// The same for a channel that all phones hear, with the cell.
Bytes umtsMessageOfCell(const Situation& situation, UMTSChannel channel, ByteView message);

/// Numbered as in the packet. The messages are the network's.
enum class GSMChannel { Dedicated = 0, Broadcast = 1, Common = 3 };
/// 0x512F: a message of GSM's radio resource control. Before those of the broadcast and the common channel
/// there is their pseudo length.
Bytes gsmMessage(std::chrono::milliseconds now, GSMChannel channel, ByteView message);

enum class NASDirection { FromNetwork, ToNetwork };
/// 0x713A: a message between a GSM or UMTS phone and its network.
Bytes olderNASMessage(std::chrono::milliseconds now, NASDirection direction, ByteView message);

}  // namespace varnel::simulation
