#include <cstddef>

#include "LogGenerator/Packet.h"
#include "LogGenerator/Radios/Messages/MessageChoice.h"
#include "LogGenerator/Radios/Messages/NASNames.h"

namespace varnel {

namespace {

// TS 24.008 table 10.2.
constexpr NamesByType mobilityNames = {
    {0x01, "IMSI Detach Indication"},
    {0x02, "Location Updating Accept"},
    {0x04, "Location Updating Reject"},
    {0x08, "Location Updating Request"},
    {0x11, "Authentication Reject"},
    {0x12, "Authentication Request"},
    {0x14, "Authentication Response"},
    {0x18, "Identity Request"},
    {0x19, "Identity Response"},
    {0x1A, "TMSI Reallocation Command"},
    {0x1B, "TMSI Reallocation Complete"},
    {0x1C, "Authentication Failure"},
    {0x21, "CM Service Accept"},
    {0x22, "CM Service Reject"},
    {0x23, "CM Service Abort"},
    {0x24, "CM Service Request"},
    {0x25, "CM Service Prompt"},
    {0x28, "CM Re-establishment Request"},
    {0x29, "Abort"},
    {0x30, "MM Null"},
    {0x31, "MM Status"},
    {0x32, "MM Information"},
};

// TS 24.008 table 10.3.
constexpr NamesByType callNames = {
    {0x01, "Alerting"},
    {0x02, "Call Proceeding"},
    {0x03, "Progress"},
    {0x04, "CC-Establishment"},
    {0x05, "Setup"},
    {0x06, "CC-Establishment Confirmed"},
    {0x07, "Connect"},
    {0x08, "Call Confirmed"},
    {0x09, "Start CC"},
    {0x0B, "Recall"},
    {0x0E, "Emergency Setup"},
    {0x0F, "Connect Acknowledge"},
    {0x10, "User Information"},
    {0x13, "Modify Reject"},
    {0x17, "Modify"},
    {0x18, "Hold"},
    {0x19, "Hold Acknowledge"},
    {0x1A, "Hold Reject"},
    {0x1C, "Retrieve"},
    {0x1D, "Retrieve Acknowledge"},
    {0x1E, "Retrieve Reject"},
    {0x1F, "Modify Complete"},
    {0x25, "Disconnect"},
    {0x2A, "Release Complete"},
    {0x2D, "Release"},
    {0x31, "Stop DTMF"},
    {0x32, "Stop DTMF Acknowledge"},
    {0x34, "Status Enquiry"},
    {0x35, "Start DTMF"},
    {0x36, "Start DTMF Acknowledge"},
    {0x37, "Start DTMF Reject"},
    {0x39, "Congestion Control"},
    {0x3A, "Facility"},
    {0x3D, "Status"},
    {0x3E, "Notify"},
};

// TS 24.008 table 10.4.
constexpr NamesByType packetMobilityNames = {
    {0x01, "Attach Request"},
    {0x02, "Attach Accept"},
    {0x03, "Attach Complete"},
    {0x04, "Attach Reject"},
    {0x05, "Detach Request"},
    {0x06, "Detach Accept"},
    {0x08, "Routing Area Update Request"},
    {0x09, "Routing Area Update Accept"},
    {0x0A, "Routing Area Update Complete"},
    {0x0B, "Routing Area Update Reject"},
    {0x0C, "Service Request"},
    {0x0D, "Service Accept"},
    {0x0E, "Service Reject"},
    {0x10, "P-TMSI Reallocation Command"},
    {0x11, "P-TMSI Reallocation Complete"},
    {0x12, "Authentication and Ciphering Req"},
    {0x13, "Authentication and Ciphering Resp"},
    {0x14, "Authentication and Ciphering Rej"},
    {0x15, "Identity Request"},
    {0x16, "Identity Response"},
    {0x1C, "Authentication and Ciphering Failure"},
    {0x20, "GMM Status"},
    {0x21, "GMM Information"},
};

// TS 24.008 table 10.4a.
constexpr NamesByType sessionNames = {
    {0x41, "Activate PDP Context Request"},
    {0x42, "Activate PDP Context Accept"},
    {0x43, "Activate PDP Context Reject"},
    {0x44, "Request PDP Context Activation"},
    {0x45, "Request PDP Context Activation rej."},
    {0x46, "Deactivate PDP Context Request"},
    {0x47, "Deactivate PDP Context Accept"},
    {0x48, "Modify PDP Context Request(Network to MS direction)"},
    {0x49, "Modify PDP Context Accept (MS to network direction)"},
    {0x4A, "Modify PDP Context Request(MS to network direction)"},
    {0x4B, "Modify PDP Context Accept (Network to MS direction)"},
    {0x4C, "Modify PDP Context Reject"},
    {0x4D, "Activate Secondary PDP Context Request"},
    {0x4E, "Activate Secondary PDP Context Accept"},
    {0x4F, "Activate Secondary PDP Context Reject"},
    {0x55, "SM Status"},
    {0x56, "Activate MBMS Context Request"},
    {0x57, "Activate MBMS Context Accept"},
    {0x58, "Activate MBMS Context Reject"},
    {0x59, "Request MBMS Context Activation"},
    {0x5A, "Request MBMS Context Activation Reject"},
    {0x5B, "Request Secondary PDP Context Activation"},
    {0x5C, "Request Secondary PDP Context Activation Reject"},
    {0x5D, "Notification"},
};

// TS 24.011 table 8.1.
constexpr NamesByType shortMessageNames = {
    {0x01, "CP-DATA"},
    {0x04, "CP-ACK"},
    {0x10, "CP-ERROR"},
};

// TS 24.080 3.4.
constexpr NamesByType supplementaryNames = {
    {0x2A, "Release Complete"},
    {0x3A, "Facility"},
    {0x3B, "Register"},
};

// In messages of mobility, calls, and supplementary services the two upper bits of the type are a sequence
// number.
constexpr std::uint8_t withoutSequence = 0x3F;

std::string_view nameOrEmpty(std::uint8_t discriminator, std::uint8_t type) {
  // TS 24.007 table 11.2.
  enum { Calls = 3, Mobility = 5, RadioResources = 6, PacketMobility = 8, ShortMessages = 9, Sessions = 10 };
  constexpr std::uint8_t supplementaryServices = 11;
  switch (discriminator) {
    case Calls:
      return callNames[type & withoutSequence];
    case Mobility:
      return mobilityNames[type & withoutSequence];
    case RadioResources:
      return gsmRRName(type);
    case PacketMobility:
      return packetMobilityNames[type];
    case ShortMessages:
      return shortMessageNames[type];
    case Sessions:
      return sessionNames[type];
    case supplementaryServices:
      return supplementaryNames[type & withoutSequence];
    default:
      return {};
  }
}

}  // namespace

std::string_view circuitNASName(ByteView message) {
  if (message.size() < 2) return unknownMessage;
  const std::string_view name = nameOrEmpty(message[0] & 0xF, message[1]);
  return name.empty() ? unknownMessage : name;
}

}  // namespace varnel
