#include "programs/varnel-telephonyd/simulation/GPRSBroadcast.h"

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t positionCode = 0x51F4, cellOptionsCode = 0x51F5, timersCode = 0x51F6,
                        packetBroadcastChannelCode = 0x51FB, systemInformationCode = 0x51FD;

}  // namespace

Bytes gprsInformationPosition(const Situation& situation) {
  constexpr std::size_t size = 15;
  constexpr std::int64_t normalChannel = 0, extendedChannel = 1;
  return PacketWriter(positionCode, situation.now, size)
      .u8(14, situation.serving.identity % 4 == 0 ? extendedChannel : normalChannel)
      .finish();
}

Bytes gprsCellOptions(const Situation& situation) {
  constexpr std::size_t size = 18;
  constexpr std::int64_t upToPriority4 = 6, allPriorities = 7;
  const std::uint32_t identity = situation.serving.identity;
  return PacketWriter(cellOptionsCode, situation.now, size)
      .u8(13, identity % 4 != 2)  // packet flow contexts
      .u8(14, identity % 6 == 0 ? upToPriority4 : allPriorities)
      .u8(15, identity % 4 == 0 ? 1 : 0)  // control order
      .finish();
}

Bytes gprsTimers(const Situation& situation) {
  constexpr std::size_t size = 24;
  const std::uint32_t identity = situation.serving.identity;
  return PacketWriter(timersCode, situation.now, size)
      .u8(15, identity / 2 % 3)                      // T3192: 500, 1000 or 1500 ms
      .u8(16, std::uint32_t{1} << identity / 2 % 4)  // seconds without discontinuous reception
      .u8(17, identity % 4 == 0)                     // access bursts of 11 bits
      .finish();
}

Bytes gprsPacketBroadcastChannel(const Situation& situation) {
  constexpr std::size_t size = 34;
  // No network has this channel.
  return PacketWriter(packetBroadcastChannelCode, situation.now, size).u8(13, 0).finish();
}

Bytes gprsSystemInformation(const Situation& situation) {
  constexpr std::size_t size = 35;
  constexpr std::int64_t changeInterval_min = 2;
  const std::int64_t changes =
      std::chrono::duration_cast<std::chrono::minutes>(situation.now).count() / changeInterval_min;
  return PacketWriter(systemInformationCode, situation.now, size)
      .u8(13, 0)                                    // packet system information on its own channel
      .u8(14, 1 + changes % 8)                      // counters of the repetitions
      .u8(15, 2 + changes % 8)                      // of low and high rate
      .u8(16, situation.serving.identity % 4 == 0)  // extended measurement order
      .u8(33, 1)                                    // the phone may ask for system information
      .finish();
}

}  // namespace varnel::simulation
