#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// The width of the channel numbers in a packet. The packets of older modems have 16 bits.
enum class ChannelWidth { Bits16, Bits32 };

/// 0xB0C1: what the master information block of the serving cell says.
Bytes lteMasterInformation(const Situation& situation, ChannelWidth width);
/// 0xB0C2: the identity of the serving cell, its channels, and its network.
Bytes lteServingCell(const Situation& situation, ChannelWidth width);

}  // namespace varnel::simulation
