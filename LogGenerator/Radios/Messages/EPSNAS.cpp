#include <cstddef>

#include "LogGenerator/Packet.h"
#include "LogGenerator/Radios/Messages/MessageChoice.h"
#include "LogGenerator/Radios/Messages/NASNames.h"

namespace varnel {

namespace {

// TS 24.301 table 9.8.1.
constexpr NamesByType mobilityNames = {
    {0x41, "Attach request"},
    {0x42, "Attach accept"},
    {0x43, "Attach complete"},
    {0x44, "Attach reject"},
    {0x45, "Detach request"},
    {0x46, "Detach accept"},
    {0x48, "Tracking area update request"},
    {0x49, "Tracking area update accept"},
    {0x4A, "Tracking area update complete"},
    {0x4B, "Tracking area update reject"},
    {0x4C, "Extended service request"},
    {0x4D, "Control plane service request"},
    {0x4E, "Service reject"},
    {0x4F, "Service accept"},
    {0x50, "GUTI reallocation command"},
    {0x51, "GUTI reallocation complete"},
    {0x52, "Authentication request"},
    {0x53, "Authentication response"},
    {0x54, "Authentication reject"},
    {0x55, "Identity request"},
    {0x56, "Identity response"},
    {0x5C, "Authentication failure"},
    {0x5D, "Security mode command"},
    {0x5E, "Security mode complete"},
    {0x5F, "Security mode reject"},
    {0x60, "EMM status"},
    {0x61, "EMM information"},
    {0x62, "Downlink NAS transport"},
    {0x63, "Uplink NAS transport"},
    {0x64, "CS service notification"},
    {0x68, "Downlink generic NAS transport"},
    {0x69, "Uplink generic NAS transport"},
};

// TS 24.301 table 9.8.2.
constexpr NamesByType sessionNames = {
    {0xC1, "Activate default EPS bearer context request"},
    {0xC2, "Activate default EPS bearer context accept"},
    {0xC3, "Activate default EPS bearer context reject"},
    {0xC5, "Activate dedicated EPS bearer context request"},
    {0xC6, "Activate dedicated EPS bearer context accept"},
    {0xC7, "Activate dedicated EPS bearer context reject"},
    {0xC9, "Modify EPS bearer context request"},
    {0xCA, "Modify EPS bearer context accept"},
    {0xCB, "Modify EPS bearer context reject"},
    {0xCD, "Deactivate EPS bearer context request"},
    {0xCE, "Deactivate EPS bearer context accept"},
    {0xD0, "PDN connectivity request"},
    {0xD1, "PDN connectivity reject"},
    {0xD2, "PDN disconnect request"},
    {0xD3, "PDN disconnect reject"},
    {0xD4, "Bearer resource allocation request"},
    {0xD5, "Bearer resource allocation reject"},
    {0xD6, "Bearer resource modification request"},
    {0xD7, "Bearer resource modification reject"},
    {0xD9, "ESM information request"},
    {0xDA, "ESM information response"},
    {0xDB, "Notification"},
    {0xDC, "ESM dummy message"},
    {0xE8, "ESM status"},
    {0xE9, "Remote UE report"},
    {0xEA, "Remote UE report response"},
    {0xEB, "ESM data transport"},
};

constexpr std::uint8_t mobility = 7, session = 2;  // protocol discriminators
constexpr std::size_t protectedHeaderSize = 6;

std::string_view plainName(ByteView message) {
  const Packet octets(message);
  const unsigned discriminator = octets.u8(0) & 0xFU;
  std::string_view name;
  if (discriminator == mobility && octets.u8(0) >> 4 == 0) name = mobilityNames[octets.u8(1)];
  if (discriminator == session) name = sessionNames[octets.u8(2)];
  return name;
}

}  // namespace

std::string_view epsNASName(ByteView message) {
  if (message.empty()) return unknownMessage;
  const unsigned discriminator = message[0] & 0xFU, securityHeader = message[0] >> 4;
  // The security header types of TS 24.301 9.3.1.
  enum { Plain, Integrity, Ciphered, IntegrityNewContext, CipheredNewContext, PartiallyCiphered, Reserved };
  constexpr unsigned firstServiceRequest = 12;  // 13 to 15 are read as 12
  std::string_view name;
  if (discriminator == mobility && securityHeader >= firstServiceRequest) {
    name = "Service request";
  } else if (discriminator != mobility || securityHeader == Plain) {
    name = plainName(message);
    if (name.empty() && (discriminator == mobility || discriminator == session)) return unknownMessage;
  } else if (securityHeader == Integrity || securityHeader == IntegrityNewContext ||
             securityHeader == PartiallyCiphered) {
    if (message.size() <= protectedHeaderSize) return unknownMessage;
    name = plainName(message.subspan(protectedHeaderSize));
    if (name.empty() && securityHeader != PartiallyCiphered) return unknownMessage;
  }
  return name.empty() ? cipheredMessage : name;
}

}  // namespace varnel
