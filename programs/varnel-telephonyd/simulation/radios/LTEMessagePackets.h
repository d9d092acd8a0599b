#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// The channels of LTE's radio resource control.
enum class LTEChannel { Broadcast, Paging, DownlinkCommon, DownlinkDedicated, UplinkCommon, UplinkDedicated };
/// How modems of several years send their messages: the version of the packet.
enum class LTEMessageLayout { Version8, Version15, Version26, Version30 };

/// 0xB0C0: a message of the serving cell. System information says which blocks it holds: bit n for block n.
Bytes lteMessage(const Situation& situation, LTEMessageLayout layout, LTEChannel channel, ByteView message,
                 std::uint32_t blocks = 0);

/// The kinds of messages between the phone and the network that have packets of their own.
enum class NASKind {
  ProtectedMobilityFromNetwork = 0xB0EA,
  ProtectedMobilityToNetwork = 0xB0EB,
  MobilityFromNetwork = 0xB0EC,
  MobilityToNetwork = 0xB0ED,
  SessionFromNetwork = 0xB0E2,
  SessionToNetwork = 0xB0E3
};
Bytes lteNASMessage(std::chrono::milliseconds now, NASKind kind, ByteView message);

}  // namespace varnel::simulation
