#include "programs/varnel-telephonyd/simulation/radios/OlderMessagePackets.h"

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t umtsCode = 0x412F, gsmCode = 0x512F, nasCode = 0x713A;

}  // namespace

Bytes umtsMessage(std::chrono::milliseconds now, UMTSChannel channel, ByteView message) {
  PacketWriter packet(umtsCode, now, 17);
  packet.u8(13, static_cast<std::int64_t>(channel)).u16(15, static_cast<std::int64_t>(message.size()));
  return packet.append(message).finish();
}

Bytes umtsMessageOfCell(const Situation& situation, UMTSChannel channel, ByteView message) {
  constexpr std::int64_t withCell = 0x80;
  PacketWriter packet(umtsCode, situation.now, 21);
  packet.u8(13, static_cast<std::int64_t>(channel) | withCell)
      .u16(15, static_cast<std::int64_t>(message.size()))
      .u16(17, situation.serving.channel)
      .u16(19, situation.serving.code);
  return packet.append(message).finish();
}

Bytes gsmMessage(std::chrono::milliseconds now, GSMChannel channel, ByteView message) {
  constexpr std::int64_t fromNetwork = 0x80;
  const std::size_t typeAt = channel == GSMChannel::Dedicated ? 1 : 2;
  PacketWriter packet(gsmCode, now, 16);
  packet.u8(13, static_cast<std::int64_t>(channel) | fromNetwork)
      .u8(14, message[typeAt])
      .u8(15, static_cast<std::int64_t>(message.size()));
  return packet.append(message).finish();
}

Bytes olderNASMessage(std::chrono::milliseconds now, NASDirection direction, ByteView message) {
  PacketWriter packet(nasCode, now, 18);
  packet.u8(13, direction == NASDirection::ToNetwork).u32(14, static_cast<std::int64_t>(message.size()));
  return packet.append(message).finish();
}

}  // namespace varnel::simulation
