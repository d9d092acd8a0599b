#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// The packets with which a connected LTE modem reports its transmit power, which follows the path loss: two
/// of the shared channel, one of the control channel. Each has some records, the latest last.

/// The versions of older modems (0xB139: 43, 0xB16E: 5, 0xB16F: 4) and of newer ones (102, 25, 24).
enum class TransmitPowerLayouts { Older, Newer };

Bytes lteUplinkTransmissions(const Situation& situation, TransmitPowerLayouts layouts, Random& random);
Bytes lteSharedChannelPower(const Situation& situation, TransmitPowerLayouts layouts, Random& random);
Bytes lteControlChannelPower(const Situation& situation, TransmitPowerLayouts layouts, Random& random);

}  // namespace varnel::simulation
