#include "programs/varnel-telephonyd/simulation/HRPDPackets.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t fingersCode = 0x108A, statusCode = 0x1183, forwardCode = 0x1192, reverseCode = 0x127E,
                        activeSetCode = 0x12B6;
constexpr int noPilot = 0xFFFF;
constexpr std::int64_t strengthUnits = 512;  // of the whole

std::int64_t wholeDecibels(std::int64_t level_cdbm) {
  return std::clamp<std::int64_t>(level_cdbm / 100, -128, 127);
}

}  // namespace

Bytes hrpdStatusPacket(std::chrono::milliseconds now, const HRPDStatus& status) {
  constexpr std::size_t size = 50;
  return PacketWriter(statusCode, now, size)
      .bits(13, 0, 11, status.channel)
      .bits(14, 3, 5, status.bandClass)
      .u8(15, wholeDecibels(status.level_cdbm))
      .u8(16, wholeDecibels(status.secondLevel_cdbm))
      .u8(17, wholeDecibels(status.transmitPower_cdbm))
      .u16(18, status.servingPilot.value_or(noPilot))
      .u8(36, static_cast<std::int64_t>(status.state))
      .u8(37, static_cast<std::int64_t>(status.session))
      .bits(38, 0, 24, status.address)
      .u8(41, status.colorCode)
      .finish();
}

Bytes hrpdActiveSetPacket(std::chrono::milliseconds now, const std::vector<ReceivedPilot>& pilots) {
  constexpr std::size_t headSize = 25, recordSize = 12;
  PacketWriter packet(activeSetCode, now, headSize);
  packet
      .u8(13, 1)  // version
      .u8(15, std::ssize(pilots));
  for (const ReceivedPilot& pilot : pilots) {
    const std::int64_t strength = pilot.strength * strengthUnits / ReceivedPilot::whole;
    packet.record(recordSize).u16(0, pilot.cell->code).u16(2, std::max<std::int64_t>(strength, 1));
  }
  return packet.finish();
}

Bytes hrpdFingersPacket(std::chrono::milliseconds now, const std::vector<Finger>& fingers) {
  constexpr std::size_t headSize = 23, recordSize = 14;
  PacketWriter packet(fingersCode, now, headSize);
  packet
      .u8(13, 1)  // version
      .u8(22, std::ssize(fingers));
  for (const Finger& finger : fingers)
    packet.record(recordSize)
        .u16(0, finger.cell ? finger.cell->code : noPilot)
        .bits(6, 0, 16, finger.carrierToInterference);
  return packet.finish();
}

Bytes hrpdForwardPacket(std::chrono::milliseconds now, std::uint32_t second, const ForwardPackets& packets) {
  constexpr std::size_t headSize = 17, counterSize = 4;
  PacketWriter packet(forwardCode, now, headSize);
  packet.u32(13, second);
  for (const std::uint32_t count : packets.counts()) packet.record(counterSize).u32(0, count);
  return packet.finish();
}

Bytes hrpdReversePacket(std::chrono::milliseconds now, std::uint32_t second, const ReversePackets& packets) {
  constexpr std::size_t size = 1750, headSize = 18;
  constexpr std::size_t counterSize = 4, unusedSize = 8;
  PacketWriter packet(reverseCode, now, headSize);
  packet
      .u8(13, 1)  // version
      .u32(14, second);
  for (std::size_t pilots = 0; pilots < ReversePackets::activeSetSizes; ++pilots) {
    for (std::size_t mode = 0; mode < ReversePackets::modes; ++mode) {
      for (std::size_t index = 0; index < ReversePackets::sizes; ++index) {
        for (const std::uint32_t count : packets.counts(pilots, mode, index))
          packet.record(counterSize).u32(0, count);
        packet.record(unusedSize);
      }
    }
  }
  return packet.padTo(size).finish();
}

}  // namespace varnel::simulation
