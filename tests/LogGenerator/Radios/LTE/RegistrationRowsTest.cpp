#include "LogGenerator/Radios/LTE/Registration.h"

#include <gtest/gtest.h>

#include <string>

#include "tests/support/Describe.h"
#include "tests/support/PacketBuilder.h"

namespace varnel::lte {
namespace {

constexpr std::size_t header = 13, size = header + 19;

// Registered with network 262-02 by the entity 310-410, group 0x8001, code 5.
PacketBuilder registration(std::uint8_t state = 3, std::uint16_t substate = 0) {
  return PacketBuilder(0xB0EE, size)
      .u8(header, 2)
      .u8(header + 1, state)
      .u16(header + 2, substate)
      .u8(header + 4, 0x62)
      .u8(header + 5, 0xF2)
      .u8(header + 6, 0x20)
      .u8(header + 7, 1)
      .u8(header + 8, 6)
      .u8(header + 9, 0x13)
      .u8(header + 10, 0x00)
      .u8(header + 11, 0x14)
      .u16(header + 12, 0x8001)
      .u8(header + 14, 5)
      .u32(header + 15, 0x0A0B0C0D);
}

class LTERegistrationRows : public testing::Test {
 protected:
  LTERegistrationRows() { decoder.updateSectionRef(section); }

  void decode(const PacketBuilder& packet) { decoder.updateWithData_logCode(Packet(packet.bytes()), 0xB0EE); }
  std::string shown(std::string_view entry) const {
    const std::string* text = section.dictionary()->get(entry).string();
    return text ? *text : "no text";
  }
  std::string substate(std::uint8_t state, std::uint16_t raw) {
    decode(registration(state, raw));
    return shown("EMM Substate");
  }

  Value section = Value::ofDictionary();
  Registration decoder;
};

TEST_F(LTERegistrationRows, ARegistrationShowsItsNetworkAndHidesThePerson) {
  decode(registration());
  EXPECT_EQ(described(section),
            R"({Version: "2", EMM State: "Registered", EMM Substate: "Normal Service", PLMN: "262-02", )"
            R"(MME PLMN: "310-410", MME Group: "32769", MME Code: "5", M-TMSI: "present"})");
}

TEST_F(LTERegistrationRows, TheIdentityIsShownOnlyWhenAskedFor) {
  Registration showing(Identities::Shown);
  showing.updateSectionRef(section);
  showing.updateWithData_logCode(Packet(registration().bytes()), 0xB0EE);
  EXPECT_EQ(shown("M-TMSI"), "0x0a0b0c0d");
}

TEST_F(LTERegistrationRows, WithoutAnIdentityItsRowsAreEmpty) {
  decode(registration());
  decode(registration().u8(header + 7, 0).u8(header + 8, 255));
  for (const char* entry : {"MME PLMN", "MME Group", "MME Code", "M-TMSI"}) EXPECT_EQ(shown(entry), "");
  EXPECT_EQ(shown("PLMN"), "262-02");
}

TEST_F(LTERegistrationRows, StatesHaveNames) {
  const auto state = [&](std::uint8_t raw) {
    decode(registration(raw));
    return shown("EMM State");
  };
  EXPECT_EQ(state(0), "Null");
  EXPECT_EQ(state(1), "Deregistered");
  EXPECT_EQ(state(2), "Registered Initiated");
  EXPECT_EQ(state(4), "Tracking Area Updating Initiated");
  EXPECT_EQ(state(5), "Service Request Initiated");
  EXPECT_EQ(state(6), "Deregistered Initiated");
  EXPECT_EQ(state(7), "Unknown (7)");
  EXPECT_EQ(state(255), "Unknown (255)");
}

TEST_F(LTERegistrationRows, SubstatesAreThoseOfTheirState) {
  EXPECT_EQ(substate(0, 3), "3");
  EXPECT_EQ(substate(1, 0), "No IMSI");
  EXPECT_EQ(substate(1, 7), "Attach About to Begin");
  EXPECT_EQ(substate(1, 8), "Unknown (8)");
  EXPECT_EQ(substate(2, 1), "Waiting for Session Management");
  EXPECT_EQ(substate(2, 2), "Unknown (2)");
  EXPECT_EQ(substate(3, 2), "Attempting to Update");
  EXPECT_EQ(substate(4, 5), "Limited Service");
  EXPECT_EQ(substate(5, 1), "Update Needed");
  EXPECT_EQ(substate(5, 0x100), "Unknown (256)");
  EXPECT_EQ(substate(6, 9), "9");
  EXPECT_EQ(substate(7, 0), "Unknown (0)");
}

TEST_F(LTERegistrationRows, NoNetworkIsEmpty) {
  decode(registration().u8(header + 4, 0xFF).u8(header + 5, 0xFF).u8(header + 6, 0xFF));
  EXPECT_EQ(shown("PLMN"), "");
}

TEST_F(LTERegistrationRows, AShortPacketChangesNothing) {
  const Bytes whole = registration().bytes();
  for (std::size_t length = 0; length < whole.size(); ++length)
    decoder.updateWithData_logCode(Packet(ByteView(whole).first(length)), 0xB0EE);
  EXPECT_EQ(described(section), "{}");
}

}  // namespace
}  // namespace varnel::lte
