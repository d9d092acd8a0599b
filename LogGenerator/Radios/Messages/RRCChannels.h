#pragma once

#include "LogGenerator/Radios/Messages/MessageChoice.h"

namespace varnel {

/// The channel, or the type of message, that a packet's number stands for. Modems number them anew from
/// version to version. Null for a number that is not known.
const MessageChannel* lteRRCChannel(unsigned packetVersion, unsigned number);
const MessageChannel* nrRRCChannel(unsigned packetVersion, unsigned number);

/// The channel of UMTS that a packet's number stands for. Null for a number that is not known.
const MessageChannel* umtsRRCChannel(unsigned number);
/// The system information block that a packet's number stands for. One number means another block in packets
/// that name their cell. Null for a number that is not known.
enum class BlockNumbers { WithoutCell, WithCell };
const MessageChannel* umtsSystemInformationBlock(unsigned number, BlockNumbers numbers);

}  // namespace varnel
