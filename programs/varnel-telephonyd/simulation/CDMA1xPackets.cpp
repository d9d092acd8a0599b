#include "programs/varnel-telephonyd/simulation/CDMA1xPackets.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t statusCode = 0x119C, trafficFrameCode = 0x119D, systemCode = 0x134F;

// A container of subpackets: their number, then one behind the other.
constexpr std::size_t countOffset = 14, firstSubpacket = 17;
enum SubpacketIdentity { SystemState = 1, Radio = 2, ActiveSet = 3, Fingers = 4, TrafficDemodulation = 11 };

void beginSubpacket(PacketWriter& packet, std::size_t start, SubpacketIdentity identity, std::size_t size) {
  packet.u8(start, identity).u16(start + 2, static_cast<std::int64_t>(size));
}

// Levels are sent in steps of 0.334 dB, 0 being -63.248 dBm.
std::int64_t gainSteps(std::int64_t level_cdbm) {
  return std::clamp<std::int64_t>((level_cdbm * 10 + 63'248) / 334, -128, 127);
}

// Energies are sums over that many chips, scaled by a gain and an exponent, and above the noise that such a
// sum collects: energy = (strength + 1/chips) * 9 * chips^2 * gain / 2^(2 * exponent - 3).
constexpr std::int64_t chips = 512, gain = 4, exponent = 5;
constexpr std::int64_t energyOfWhole = 9 * chips * chips * gain >> (2 * exponent - 3);
std::int64_t energy(std::int64_t strength) {
  return strength * energyOfWhole / ReceivedPilot::whole + energyOfWhole / chips;
}

// Each pilot is followed by the energies of its fingers, so many for all; then comes its own.
constexpr std::size_t fingersPerPilot = 2;
constexpr std::size_t pilotsStart = 12, energyOffset = 12 + 4 * fingersPerPilot;
constexpr std::size_t pilotSize = (6 * fingersPerPilot + 15) & 0xFFC;
static_assert(energyOffset + 2 <= pilotSize);

constexpr std::size_t systemStateSize = 8, radioSize = 16;
constexpr std::size_t fingersHead = 8, fingerSize = 4;

void writeActiveSet(PacketWriter& packet, std::size_t start, const CDMA1xStatus& status) {
  packet.u16(start + 4, chips)
      .u8(start + 6, gain)
      .u8(start + 7, exponent)
      .u8(start + 8, std::ssize(status.pilots))
      .u8(start + 9, fingersPerPilot)
      .u16(start + 10, status.referencePilot);
  std::size_t record = start + pilotsStart;
  for (const ReceivedPilot& pilot : status.pilots) {
    packet.u16(record, pilot.cell->code).u16(record + energyOffset, energy(pilot.strength));
    record += pilotSize;
  }
}

// One finger a pilot.
void writeFingers(PacketWriter& packet, std::size_t start, const CDMA1xStatus& status) {
  packet.u8(start + 4, std::ssize(status.pilots));
  std::size_t record = start + fingersHead;
  for (const ReceivedPilot& pilot : status.pilots) {
    packet.u16(record, pilot.cell->code).u16(record + 2, energy(pilot.strength));
    record += fingerSize;
  }
}

}  // namespace

Bytes cdma1xStatusPacket(std::chrono::milliseconds now, const CDMA1xStatus& status) {
  const std::size_t activeSetSize = pilotsStart + pilotSize * status.pilots.size();
  const std::size_t fingersSize = fingersHead + fingerSize * status.pilots.size();
  const std::size_t radio = firstSubpacket + systemStateSize, activeSet = radio + radioSize,
                    fingers = activeSet + activeSetSize;
  PacketWriter packet(PacketWriter::LogType::Modem, statusCode, now, fingers + fingersSize);
  packet
      .u8(13, 1)  // version
      .u8(countOffset, 4);
  beginSubpacket(packet, firstSubpacket, SystemState, systemStateSize);
  packet.u8(firstSubpacket + 4, static_cast<std::int64_t>(status.state));
  beginSubpacket(packet, radio, Radio, radioSize);
  packet.u8(radio + 4, status.bandClass)
      .u8(radio + 5, status.bandClass)
      .u16(radio + 6, status.channel)
      .u16(radio + 8, status.channel)
      .u8(radio + 10, gainSteps(status.level_cdbm))
      .u8(radio + 11, gainSteps(status.secondLevel_cdbm))
      .u16(radio + 12, status.transmitPower_cdbm / 10);
  beginSubpacket(packet, activeSet, ActiveSet, activeSetSize);
  writeActiveSet(packet, activeSet, status);
  beginSubpacket(packet, fingers, Fingers, fingersSize);
  writeFingers(packet, fingers, status);
  return packet.finish();
}

Bytes trafficFramePacket(std::chrono::milliseconds now, Frame frame) {
  constexpr std::size_t subpacketSize = 28;
  PacketWriter packet(PacketWriter::LogType::Modem, trafficFrameCode, now, firstSubpacket + subpacketSize);
  packet
      .u8(13, 1)  // version
      .u8(countOffset, 1);
  beginSubpacket(packet, firstSubpacket, TrafficDemodulation, subpacketSize);
  packet.u8(firstSubpacket + 24, frame == Frame::Erased);
  return packet.finish();
}

Bytes cdmaSystemPacket(std::chrono::milliseconds now, const CDMASystem& system) {
  constexpr std::size_t size = 186;
  constexpr std::int64_t cdmaSystem = 2;
  return PacketWriter(PacketWriter::LogType::Modem, systemCode, now, size)
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
