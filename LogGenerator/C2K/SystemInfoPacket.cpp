#include "LogGenerator/C2K/DisplayVariables.h"
#include "LogGenerator/C2K/PacketDecoders.h"
#include "base/Log.h"

namespace varnel::c2k {

namespace {

constexpr std::size_t versionOffset = 13;
constexpr std::uint8_t oldestVersion = 2;

// Enhanced roaming indicators.
constexpr std::string_view roamingIndicators[] = {
    "OFF [0]",
    "ON [1]",
    "Flashing [2]",
    "Out of Neighborhood [3]",
    "Out of Building [4]",
    "Preferred system [5]",
    "Available system [6]",
    "Alliance partner [7]",
    "Premium partner [8]",
    "Full service functionality [9]",
    "Partial service functionality [10]",
    "Banner ON [11]",
    "Banner OFF [12]",
};

constexpr VariableField roaming[] = {
    {u32(42), "k1xRoamingHome", entry(roamingIndicators, integer("ERI - %d"))},
};

constexpr Source systemType = u32(46);
constexpr std::uint32_t knownSystemType = 2;
constexpr VariableField knownSystem[] = {
    {u16(50), "kSystemId"},
    {u16(52), "kNetworkId"},
};
constexpr Format unknownType = integer("(unknown system type %d)");
constexpr VariableField unknownSystem[] = {
    {systemType, "kSystemId", unknownType},
    {systemType, "kNetworkId", unknownType},
};

constexpr VariableField packetZone[] = {{u8(131), "kPacketZoneId"}};
constexpr Source baseStationId = u16(184);
constexpr VariableField baseStation[] = {{baseStationId, "kBaseId"}};
constexpr VariableField protocol[] = {{u8(133), "kProtocolRevision"}};

static_assert(within(roaming, systemInfoSize) && within(knownSystem, systemInfoSize) &&
              within(unknownSystem, systemInfoSize) && within(packetZone, systemInfoSize) &&
              within(protocol, systemInfoSize));

}  // namespace

void decodeSystemInfo(const Packet& packet, State& /*state*/, Lookup& lookup) {
  if (const std::uint8_t version = packet.u8(versionOffset); version < oldestVersion) {
    logError("Log code 0x134f has version=%d; only version 2 or higher expected; dropping.", version);
    return;
  }
  storeDisplayFields(packet, roaming, lookup);
  if (packet.u32(systemType.byte) == knownSystemType) {
    storeDisplayFields(packet, knownSystem, lookup);
  } else {
    storeDisplayFields(packet, unknownSystem, lookup);
  }
  storeDisplayFields(packet, packetZone, lookup);
  if (packet.holds(0, baseStationId.end())) storeDisplayFields(packet, baseStation, lookup);
  storeDisplayFields(packet, protocol, lookup);
}

}  // namespace varnel::c2k
