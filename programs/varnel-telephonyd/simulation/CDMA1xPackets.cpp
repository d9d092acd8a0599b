#include "programs/varnel-telephonyd/simulation/CDMA1xPackets.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t statusCode = 0x119C, trafficFrameCode = 0x119D, systemCode = 0x134F;

// A container of subpackets: their number, then the subpackets one after the other.
constexpr std::size_t containerHead = 17;
enum SubpacketIdentity { SystemState = 1, Radio = 2, ActiveSet = 3, Fingers = 4, TrafficDemodulation = 11 };

PacketWriter container(std::uint16_t code, std::chrono::milliseconds now, int subpackets) {
  return PacketWriter(code, now, containerHead)
      .u8(13, 1)  // version
      .u8(14, subpackets);
}

// Begins a subpacket. Offsets count from its start. The records after its head belong to it.
PacketWriter& subpacket(PacketWriter& packet, SubpacketIdentity identity, std::size_t headSize,
                        std::size_t recordsSize = 0) {
  return packet.record(headSize).u8(0, identity).u16(2, static_cast<std::int64_t>(headSize + recordsSize));
}

// Levels are sent in steps of 0.334 dB. 0 stands for -63.248 dBm.
std::int64_t gainSteps(std::int64_t level_cdbm) {
  return std::clamp<std::int64_t>((level_cdbm * 10 + 63'248) / 334, -128, 127);
}

// An energy is a sum over this many chips, scaled by a gain and an exponent. It includes the noise of such a
// sum: energy = (strength + 1/chips) * 9 * chips^2 * gain / 2^(2 * exponent - 3).
constexpr std::int64_t chips = 512, gain = 4, exponent = 5;
constexpr std::int64_t energyOfWhole = 9 * chips * chips * gain >> (2 * exponent - 3);
std::int64_t energy(std::int64_t strength) {
  return strength * energyOfWhole / ReceivedPilot::whole + energyOfWhole / chips;
}

// After each pilot come the energies of its fingers, the same number for all, and then its own energy.
constexpr std::size_t fingersPerPilot = 2;
constexpr std::size_t activeSetHead = 12, energyOffset = 12 + 4 * fingersPerPilot;
constexpr std::size_t pilotSize = (6 * fingersPerPilot + 15) & 0xFFC;
static_assert(energyOffset + 2 <= pilotSize);

constexpr std::size_t systemStateSize = 8, radioSize = 16;
constexpr std::size_t fingersHead = 8, fingerSize = 4;

void writeActiveSet(PacketWriter& packet, const CDMA1xStatus& status) {
  subpacket(packet, ActiveSet, activeSetHead, pilotSize * status.pilots.size())
      .u16(4, chips)
      .u8(6, gain)
      .u8(7, exponent)
      .u8(8, std::ssize(status.pilots))
      .u8(9, fingersPerPilot)
      .u16(10, status.referencePilot);
  for (const ReceivedPilot& pilot : status.pilots)
    packet.record(pilotSize).u16(0, pilot.cell->code).u16(energyOffset, energy(pilot.strength));
}

// One finger per pilot.
void writeFingers(PacketWriter& packet, const CDMA1xStatus& status) {
  subpacket(packet, Fingers, fingersHead, fingerSize * status.pilots.size()).u8(4, std::ssize(status.pilots));
  for (const ReceivedPilot& pilot : status.pilots)
    packet.record(fingerSize).u16(0, pilot.cell->code).u16(2, energy(pilot.strength));
}

}  // namespace

Bytes cdma1xStatusPacket(std::chrono::milliseconds now, const CDMA1xStatus& status) {
  PacketWriter packet = container(statusCode, now, 4);
  subpacket(packet, SystemState, systemStateSize).u8(4, static_cast<std::int64_t>(status.state));
  subpacket(packet, Radio, radioSize)
      .u8(4, status.bandClass)
      .u8(5, status.bandClass)
      .u16(6, status.channel)
      .u16(8, status.channel)
      .u8(10, gainSteps(status.level_cdbm))
      .u8(11, gainSteps(status.secondLevel_cdbm))
      .u16(12, status.transmitPower_cdbm / 10);
  writeActiveSet(packet, status);
  writeFingers(packet, status);
  return packet.finish();
}

Bytes trafficFramePacket(std::chrono::milliseconds now, Frame frame) {
  constexpr std::size_t subpacketSize = 28;
  PacketWriter packet = container(trafficFrameCode, now, 1);
  return subpacket(packet, TrafficDemodulation, subpacketSize).u8(24, frame == Frame::Erased).finish();
}

Bytes cdmaSystemPacket(std::chrono::milliseconds now, const CDMASystem& system) {
  constexpr std::size_t size = 186;
  constexpr std::int64_t cdmaSystem = 2;
  return PacketWriter(systemCode, now, size)
      .u8(13, 2)  // version
      .u32(42, system.roamingIndicator)
      .u32(46, cdmaSystem)
      .u16(50, system.system)
      .u16(52, system.network)
      .u8(131, system.packetZone)
      .u8(133, system.protocolRevision)
      .u16(184, system.baseStation)
      .finish();
}

}  // namespace varnel::simulation
