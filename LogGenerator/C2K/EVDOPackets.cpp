#include "LogGenerator/C2K/BandClass.h"
#include "LogGenerator/C2K/DisplayVariables.h"
#include "LogGenerator/C2K/PacketDecoders.h"
#include "LogGenerator/C2K/PilotStrengths.h"
#include "base/Log.h"

namespace varnel::c2k {

namespace {

constexpr std::string_view accessTerminalStates[] = {
    "Inactive [0]", "Acquisition [1]", "Sync [2]", "Idle [3]", "Access [4]", "Connected [5]",
};
constexpr std::uint8_t accessState = 4;

constexpr std::string_view sessionStates[] = {
    "Closed [0]", "AMP setup [1]", "AT-initiated neg [2]", "Initiated neg [3]", "Open [4]",
};

constexpr Format reserved = integer("[Reserved %d]");
constexpr Format dBm = integer("%+d dBm");

constexpr Source accessTerminalState = u8(36);
constexpr VariableField channel[] = {
    {bits(13, 0, 11), "kChannel"},
    {accessTerminalState, "k1xEVDODeviceState", entry(accessTerminalStates, reserved)},
    {bits(14, 3, 5), "kBandClass", bandClass},
    {s8(15), "kRxAGC0", dBm},
};
// Shown while the access terminal is in the access state or a later one.
constexpr VariableField levelsInUse[] = {
    {s8(16), "kRxAGC1", dBm},
    {s8(17), "kTxAGC", dBm},
};
constexpr VariableField session[] = {
    {u16(18), "kServingPNOffset", integer("%d × 64chips").unless(0xFFFF, "Invalid Value")},
    {u8(37), "kSessionState", entry(sessionStates, reserved)},
    {bits(38, 0, 24), "kUATI24", hexadecimal("0x%06x")},
    {u8(41), "kColorCode"},
};
static_assert(within(channel, evdoStatusSize) && within(levelsInUse, evdoStatusSize) &&
              within(session, evdoStatusSize));

constexpr std::uint16_t unassignedPN = 0xFFFF;

constexpr Variable activeSetVariable = "kActiveSetPilots";
constexpr Variable fingersVariable = "kFingerC2I";

}  // namespace

void decodeEVDOStatus(const Packet& packet, State& /*state*/, Lookup& lookup) {
  storeDisplayFields(packet, channel, lookup);
  if (packet.u8(accessTerminalState.byte) >= accessState) {
    storeDisplayFields(packet, levelsInUse, lookup);
  } else {
    for (const VariableField& field : levelsInUse) storeDisplayText(field.variable, "N/A", lookup);
  }
  storeDisplayFields(packet, session, lookup);
}

void decodeEVDOActiveSet(const Packet& packet, State& /*state*/, Lookup& lookup) {
  constexpr std::size_t countOffset = 15;
  constexpr std::size_t pilotSize = 12;
  const std::uint8_t count = packet.u8(countOffset);
  if (!packet.holds(evdoActiveSetSize, pilotSize * count)) {
    logError("Log code 0x12b6 is %u bytes long, but has %d substructs.",
             static_cast<std::uint32_t>(packet.size()), count);
    return;
  }
  PilotStrengths pilots(activeSetVariable, lookup);
  for (std::uint8_t i = 0; i < count; ++i) {
    const Packet pilot = packet.from(evdoActiveSetSize + pilotSize * i);
    pilots.add(i, pilot.u16(0), decibelFormat, decibelsOfRatio512(pilot.u16(2)));
  }
  pilots.publishOrNone();
}

void decodeFingerC2I(const Packet& packet, State& /*state*/, Lookup& lookup) {
  constexpr std::size_t countOffset = 22;
  constexpr std::size_t fingerSize = 14;
  const std::uint8_t count = packet.u8(countOffset);
  if (packet.size() != fingerC2ISize + fingerSize * count) {
    // Kept: the size in the log line is that of a packet without fingers, not the expected one.
    logError("Log code 0x108a has bad length of %u bytes, but has %d substructs (size=%u).",
             static_cast<std::uint32_t>(packet.size()), count, fingerC2ISize);
    return;
  }
  PilotStrengths fingers(fingersVariable, lookup);
  for (std::uint8_t i = 0; i < count; ++i) {
    const Packet finger = packet.from(fingerC2ISize + fingerSize * i);
    if (const std::uint16_t pn = finger.u16(0); pn != unassignedPN) {
      fingers.add(i, pn, decibelFormat, decibelsOfRatio512(finger.u16(6)));
    }
  }
  fingers.publishOrNone();
}

void listEVDOFormats(std::vector<VariableFormat>& formats) {
  for (const std::span<const VariableField> table :
       {std::span<const VariableField>(channel), std::span<const VariableField>(levelsInUse),
        std::span<const VariableField>(session)}) {
    for (const VariableField& field : table) formats.push_back({field.variable, field.format});
  }
  formats.push_back({activeSetVariable, decibelFormat});
  formats.push_back({fingersVariable, decibelFormat});
}

}  // namespace varnel::c2k
