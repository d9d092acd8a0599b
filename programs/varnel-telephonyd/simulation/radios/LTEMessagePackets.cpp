#include "programs/varnel-telephonyd/simulation/radios/LTEMessagePackets.h"

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/radios/FrameClock.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t messageCode = 0xB0C0;

// Offsets from the start of the packet; numbers of the channels in the order of the enumeration.
struct Layout {
  int version;
  std::size_t bearer, cell, channelNumber, frame, channel, blocks, length, size;
  int channels[6];
};
constexpr Layout layouts[] = {
    {8, 16, 17, 19, 23, 25, 26, 30, 32, {2, 4, 5, 6, 7, 8}},
    {15, 16, 17, 19, 23, 25, 26, 30, 32, {2, 5, 6, 7, 8, 9}},
    {26, 18, 19, 21, 25, 27, 28, 32, 34, {3, 7, 8, 9, 10, 11}},
    {30, 18, 19, 21, 25, 27, 28, 32, 37, {3, 7, 8, 9, 10, 11}},
};
constexpr int release = 15, releaseMinor = 0x90;

bool isUplink(LTEChannel channel) {
  return channel == LTEChannel::UplinkCommon || channel == LTEChannel::UplinkDedicated;
}
bool isDedicated(LTEChannel channel) {
  return channel == LTEChannel::DownlinkDedicated || channel == LTEChannel::UplinkDedicated;
}

}  // namespace

Bytes lteMessage(const Situation& situation, LTEMessageLayout layoutName, LTEChannel channel,
                 ByteView message, std::uint32_t blocks) {
  const Layout& layout = layouts[static_cast<std::size_t>(layoutName)];
  const FrameClock clock(situation.serving, situation.now);
  PacketWriter packet(messageCode, situation.now, layout.size);
  packet.u8(13, layout.version)
      .u8(14, release)
      .u8(15, releaseMinor)
      .u8(layout.bearer, isDedicated(channel))
      .u16(layout.cell, situation.serving.code)
      .u32(layout.channelNumber, situation.serving.channel)
      .u8(layout.channel, layout.channels[static_cast<std::size_t>(channel)])
      .u32(layout.blocks, blocks)
      .u16(layout.length, static_cast<std::int64_t>(message.size()));
  // Modems do not tell the frame of what they send, and of system information.
  if (!isUplink(channel) && channel != LTEChannel::Broadcast)
    packet.bits(layout.frame, 0, 4, clock.subframe).bits(layout.frame, 4, 10, clock.frame);
  return packet.append(message).finish();
}

Bytes lteNASMessage(std::chrono::milliseconds now, NASKind kind, ByteView message) {
  PacketWriter packet(static_cast<std::uint16_t>(kind), now, 17);
  packet.u8(13, 1).u8(14, 9).u8(15, 5).u8(16, 0);  // version, then that of the standard
  return packet.append(message).finish();
}

}  // namespace varnel::simulation
