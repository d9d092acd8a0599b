#include <cstddef>

#include "LogGenerator/Packet.h"
#include "LogGenerator/Radios/Messages/MessageChoice.h"
#include "LogGenerator/Radios/Messages/NASNames.h"

namespace varnel {

namespace {

// TS 24.501 table 9.7.1.
constexpr NamesByType mobilityNames = {
    {0x41, "Registration request"},
    {0x42, "Registration accept"},
    {0x43, "Registration complete"},
    {0x44, "Registration reject"},
    {0x45, "Deregistration request (UE originating)"},
    {0x46, "Deregistration accept (UE originating)"},
    {0x47, "Deregistration request (UE terminated)"},
    {0x48, "Deregistration accept (UE terminated)"},
    {0x4C, "Service request"},
    {0x4D, "Service reject"},
    {0x4E, "Service accept"},
    {0x4F, "Control plane service request"},
    {0x50, "Network slice-specific authentication command"},
    {0x51, "Network slice-specific authentication complete"},
    {0x52, "Network slice-specific authentication result"},
    {0x54, "Configuration update command"},
    {0x55, "Configuration update complete"},
    {0x56, "Authentication request"},
    {0x57, "Authentication response"},
    {0x58, "Authentication reject"},
    {0x59, "Authentication failure"},
    {0x5A, "Authentication result"},
    {0x5B, "Identity request"},
    {0x5C, "Identity response"},
    {0x5D, "Security mode command"},
    {0x5E, "Security mode complete"},
    {0x5F, "Security mode reject"},
    {0x64, "5GMM status"},
    {0x65, "Notification"},
    {0x66, "Notification response"},
    {0x67, "UL NAS transport"},
    {0x68, "DL NAS transport"},
};

// TS 24.501 table 9.7.2.
constexpr NamesByType sessionNames = {
    {0xC1, "PDU session establishment request"},
    {0xC2, "PDU session establishment accept"},
    {0xC3, "PDU session establishment reject"},
    {0xC5, "PDU session authentication command"},
    {0xC6, "PDU session authentication complete"},
    {0xC7, "PDU session authentication result"},
    {0xC9, "PDU session modification request"},
    {0xCA, "PDU session modification reject"},
    {0xCB, "PDU session modification command"},
    {0xCC, "PDU session modification complete"},
    {0xCD, "PDU session modification command reject"},
    {0xD1, "PDU session release request"},
    {0xD2, "PDU session release reject"},
    {0xD3, "PDU session release command"},
    {0xD4, "PDU session release complete"},
    {0xD6, "5GSM status"},
};

constexpr std::uint8_t mobility = 0x7E, session = 0x2E;  // extended protocol discriminators
constexpr std::size_t protectedHeaderSize = 7;

std::string_view plainName(ByteView message) {
  const Packet octets(message);
  std::string_view name;
  if (octets.u8(0) == mobility && (octets.u8(1) & 0xF) == 0) name = mobilityNames[octets.u8(2)];
  if (octets.u8(0) == session) name = sessionNames[octets.u8(3)];
  return name.empty() ? unknownMessage : name;
}

}  // namespace

std::string_view fiveGNASName(ByteView message) {
  const Packet octets(message);
  const bool isKnown = octets.u8(0) == mobility || octets.u8(0) == session;
  if (message.empty() || (isKnown && message.size() < 2)) return unknownMessage;
  if (!isKnown) return cipheredMessage;
  if (octets.u8(0) == session) return plainName(message);
  // The security header types of TS 24.501 9.3.
  enum { Plain, Integrity, Ciphered, IntegrityNewContext };
  switch (octets.u8(1) & 0xF) {
    case Plain:
      return plainName(message);
    case Integrity:
    case IntegrityNewContext:
      return octets.size() > protectedHeaderSize ? plainName(message.subspan(protectedHeaderSize))
                                                 : unknownMessage;
    default:
      return cipheredMessage;
  }
}

}  // namespace varnel
