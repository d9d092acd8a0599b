#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// The channels of NR's radio resource control, and what LTE carries for NR without a channel.
enum class NRChannel {
  Broadcast,
  DownlinkCommon,
  DownlinkDedicated,
  UplinkCommon,
  UplinkDedicated,
  BareReconfiguration,
  BareReconfigurationComplete
};
/// The version of the packet. Version 8 has no common channels and no dedicated channel from the network:
/// NR was only beside LTE.
enum class NRMessageLayout { Version8, Version17 };

/// 0xB821: a message of this NR cell.
Bytes nrMessage(std::chrono::milliseconds now, const Cell& cell, NRMessageLayout layout, NRChannel channel,
                ByteView message);

enum class NRNASKind {
  SessionFromNetwork = 0xB800,
  SessionToNetwork = 0xB801,
  MobilityFromNetwork = 0xB80A,
  MobilityToNetwork = 0xB80B
};
Bytes nrNASMessage(std::chrono::milliseconds now, NRNASKind kind, ByteView message);

/// A cell's identity with its network, as packets have it: bits 0 to 35, and bits 36 to 59.
std::int64_t globalIdentity(const Cell& cell);

}  // namespace varnel::simulation
