#include "LogGenerator/KLV/UTRAN/RRC_State.h"

#include "base/Describe.h"

namespace varnel {

namespace {

constexpr std::size_t expectedSize = 15;
constexpr std::size_t versionOffset = 13;
constexpr std::size_t modeOffset = 14;
constexpr std::uint8_t knownVersion = 1;
constexpr std::uint8_t unknownMode = 255;

constexpr std::string_view modes[] = {
    "Disconnected", "Connecting", "Cell Fach", "Cell DCH", "Cell PCH", "Cell URA PCH",
};

std::uint8_t rrcMode(const Packet& packet) {
  const bool isKnown = packet.holds(modeOffset, 1) && packet.u8(versionOffset) == knownVersion;
  return isKnown ? packet.u8(modeOffset) : unknownMode;
}

void update(Section& section, const Packet& packet) {
  // Kept: "is length is". A packet that is too short is decoded nevertheless.
  if (packet.size() < expectedSize) {
    logWarning("LogCode_0xD0E0 is length is %ld expected size %ld", packet.size(), expectedSize);
  }
  const std::uint8_t mode = rrcMode(packet);
  const std::string_view text = mode < std::size(modes) ? modes[mode] : "Unknown RRC Mode";
  section.setText("State", text);
  if (logTakes(logWarningPriority)) {
    logWarning("Display Dict = %s, rrc mode = %d %s", describe(section.container()), mode, text);
  }
}

constexpr PacketHandler packets[] = {
    {0xD0E0, 0, update},
};

}  // namespace

RRC_State::RRC_State() : SectionDecoder("RRC Info", "RRC Info", packets, UnknownCodes::Ignored) {}

}  // namespace varnel
