#include "programs/varnel-telephonyd/simulation/radios/NRMessagePackets.h"

#include <stdexcept>

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/radios/FrameClock.h"
#include "programs/varnel-telephonyd/simulation/radios/PackedNetwork.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t messageCode = 0xB821;
constexpr int notThere = 0;

// Offsets from the start of the packet; numbers of the channels in the order of the enumeration.
struct Layout {
  int version;
  std::size_t channelNumber, channel, blocks, length, size;
  int channels[7];
};
constexpr Layout layouts[] = {
    {8, 22, 30, 31, 35, 37, {1, notThere, notThere, notThere, 8, 9, 10}},
    {17, 30, 37, 38, 42, 44, {1, 3, 4, 6, 8, 9, 10}},
};

bool isDownlink(NRChannel channel) {
  return channel == NRChannel::Broadcast || channel == NRChannel::DownlinkCommon ||
         channel == NRChannel::DownlinkDedicated || channel == NRChannel::BareReconfiguration;
}

}  // namespace

std::int64_t globalIdentity(const Cell& cell) {
  std::int64_t network = 0;
  for (const std::uint8_t byte : packedNetwork(cell.network)) network = network << 8 | byte;
  return network << 36 | cell.identity;
}

Bytes nrMessage(std::chrono::milliseconds now, const Cell& cell, NRMessageLayout layoutName,
                NRChannel channel, ByteView message) {
  const Layout& layout = layouts[static_cast<std::size_t>(layoutName)];
  const int number = layout.channels[static_cast<std::size_t>(channel)];
  if (number == notThere) throw std::invalid_argument("this version has no such channel");
  PacketWriter packet(messageCode, now, layout.size);
  packet.u32(13, layout.version)
      .u8(17, 15)    // release
      .u8(18, 0xC0)  // and its version
      .u16(20, cell.code)
      .u32(layout.channelNumber, cell.channel)
      .u8(layout.channel, number)
      .u16(layout.length, static_cast<std::int64_t>(message.size()));
  if (layoutName == NRMessageLayout::Version17) {
    packet.u64(22, globalIdentity(cell));
  } else if (isDownlink(channel)) {
    const FrameClock clock(cell, now);
    packet.bits(26, 3, 4, clock.subframe).bits(26, 16, 10, clock.frame);
  }
  return packet.append(message).finish();
}

Bytes nrNASMessage(std::chrono::milliseconds now, NRNASKind kind, ByteView message) {
  PacketWriter packet(static_cast<std::uint16_t>(kind), now, 20);
  packet.u32(13, 1).u8(17, 15).u8(18, 4).u8(19, 0);  // version, then that of the standard
  return packet.append(message).finish();
}

}  // namespace varnel::simulation
