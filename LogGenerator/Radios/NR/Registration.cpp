#include "LogGenerator/Radios/NR/Registration.h"

#include "LogGenerator/Radios/Plmn.h"

namespace varnel::nr {

namespace {

constexpr Format unknown = integer("Unknown (%d)");
constexpr Format number = integer();

// 3GPP TS 24.501, 5.1.3.2.
constexpr Choice states[] = {
    {1, "Deregistered"}, {2, "Registered Initiated"}, {3, "Registered"}, {4, "Service Request Initiated"}};
constexpr Choice substates[] = {
    {0, "Normal Service"}, {1, "PLMN Search"}, {2, "No Cell Available"}, {5, "Limited Service"}};
constexpr std::string_view updateStatus[] = {"Updated", "Not Updated"};

constexpr std::uint16_t plmn = 7, identity = 10, trackingArea = 23;
constexpr Field entries[] = {
    {u8(4), "5GMM State", choice(states, unknown)},
    {u16(5), "5GMM Substate", choice(substates, unknown)},
    {s8(22), "Update Status", entry(updateStatus, unknown)},
};

// The 5G-GUTI (3GPP TS 23.003, 2.10.1), with the type of the mobile identity in front, which has three bits
// (3GPP TS 24.501, 9.11.3.4). The identity of another type has other contents.
constexpr std::uint32_t typeOf5GGUTI = 2;
constexpr Field identityEntries[] = {
    {u8(4), "AMF Region"},
    {u16(5), "AMF Set"},
    {u8(7), "AMF Pointer"},
};
constexpr std::string_view temporaryIdentityEntry = "5G-TMSI";
constexpr Field temporaryIdentity[] = {
    {u32(8), temporaryIdentityEntry, hexadecimal("0x%08x")},
};

}  // namespace

constexpr PacketLayout Registration::layouts[] = {
    {0xB80C, 1, 26, calling<&Registration::update>},
    {0xB80C, 0x30000, 27, calling<&Registration::update>},
};

Registration::Registration(Identities identities)
    : VersionedDecoder("Registration", layouts), _identities(identities) {}

void Registration::update(const Packet& payload) {
  sectionRef.show(payload, entries);
  sectionRef.setText("PLMN", plmnText(payload, plmn));
  // Big-endian, as on the air.
  const int trackingAreaCode =
      payload.u8(trackingArea) << 16 | payload.u8(trackingArea + 1) << 8 | payload.u8(trackingArea + 2);
  sectionRef.setInteger("Tracking Area Code", number, trackingAreaCode);
  showIdentity(payload.from(identity));
}

void Registration::showIdentity(const Packet& identity) {
  if (identity.bits(0, 0, 3) != typeOf5GGUTI) {
    sectionRef.setText("AMF PLMN", "");
    for (const Field& field : identityEntries) sectionRef.setText(field.label, "");
    sectionRef.setText(temporaryIdentityEntry, "");
    return;
  }
  sectionRef.setText("AMF PLMN", plmnText(identity, 1));
  sectionRef.show(identity, identityEntries);
  if (_identities == Identities::Shown) {
    sectionRef.show(identity, temporaryIdentity);
  } else {
    sectionRef.setText(temporaryIdentityEntry, presentText);
  }
}

}  // namespace varnel::nr
