#include "LogGenerator/Radios/LTE/Registration.h"

#include <iterator>
#include <string_view>

#include "LogGenerator/Radios/Plmn.h"

namespace varnel::lte {

namespace {

constexpr Format number = integer("%u");
constexpr Format unknown = integer("Unknown (%u)");

// 3GPP TS 24.301, 5.1.3.2.
constexpr std::string_view states[] = {"Null",
                                       "Deregistered",
                                       "Registered Initiated",
                                       "Registered",
                                       "Tracking Area Updating Initiated",
                                       "Service Request Initiated",
                                       "Deregistered Initiated"};
constexpr Format state = entry(states, unknown);

// The standard has no name for the last one; registering follows it.
constexpr std::string_view deregisteredSubstates[] = {
    "No IMSI",        "PLMN Search",     "Attach Needed",         "No Cell Available", "Attempting to Attach",
    "Normal Service", "Limited Service", "Attach About to Begin",
};
constexpr std::string_view registeringSubstates[] = {"Waiting for Network", "Waiting for Session Management"};
constexpr std::string_view registeredSubstates[] = {"Normal Service",       "Update Needed",
                                                    "Attempting to Update", "No Cell Available",
                                                    "PLMN Search",          "Limited Service"};

// The format of each state's substates.
constexpr Format substates[] = {
    number,  // null has none
    entry(deregisteredSubstates, unknown),
    entry(registeringSubstates, unknown),
    entry(registeredSubstates, unknown),
    entry(registeredSubstates, unknown),
    entry(registeredSubstates, unknown),
    number,  // nor has "deregistered initiated"
};

constexpr Field registration[] = {{u8(1), "EMM State", state}};
constexpr Source stateBits = u8(1), substateBits = u16(2);
constexpr std::size_t network = 4, identityIsValid = 7, identityNetwork = 9, size = 19;

constexpr std::string_view identityNetworkEntry = "MME PLMN", groupEntry = "MME Group",
                           codeEntry = "MME Code", temporaryIdentityEntry = "M-TMSI";
constexpr Field mobilityManagementEntity[] = {{u16(12), groupEntry}, {u8(14), codeEntry}};
constexpr Field temporaryIdentity[] = {{u32(15), temporaryIdentityEntry, hexadecimal("0x%08x")}};

void showSubstate(Section& section, const Packet& body) {
  const std::uint32_t itsState = rawValue(body, stateBits);
  const Format& format = itsState < std::size(substates) ? substates[itsState] : unknown;
  section.setText("EMM Substate", Formatter().text(body, substateBits, format));
}

}  // namespace

constexpr PacketLayout Registration::layouts[] = {{0xB0EE, 2, size, calling<&Registration::show>}};

Registration::Registration(Identities identities)
    : VersionedDecoder("Registration", layouts), _identities(identities) {}

void Registration::show(const Packet& body) {
  sectionRef.show(body, registration);
  showSubstate(sectionRef, body);
  sectionRef.setText("PLMN", plmnText(body, network));
  showIdentity(body);
}

// The identity that the network gives (GUTI, 3GPP TS 23.003, 2.8.1). Its last part names the person.
void Registration::showIdentity(const Packet& body) {
  if (body.u8(identityIsValid) == 0) {
    for (const std::string_view entry : {identityNetworkEntry, groupEntry, codeEntry, temporaryIdentityEntry})
      sectionRef.setText(entry, {});
    return;
  }
  sectionRef.setText(identityNetworkEntry, plmnText(body, identityNetwork));
  sectionRef.show(body, mobilityManagementEntity);
  if (_identities == Identities::Shown) {
    sectionRef.show(body, temporaryIdentity);
  } else {
    sectionRef.setText(temporaryIdentityEntry, presentText);
  }
}

}  // namespace varnel::lte
