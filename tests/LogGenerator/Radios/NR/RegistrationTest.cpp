#include "LogGenerator/Radios/NR/Registration.h"

#include <map>
#include <string>

#include "tests/LogGenerator/Radios/PayloadBuilder.h"
#include "tests/support/DecoderHarness.h"

namespace varnel::nr {
namespace {

class NRRegistrationTest : public RowsDecoderTest<Registration, 0xB80C> {
 protected:
  std::string text(std::string_view row) const { return *section.dictionary()->get(row).string(); }
};

PayloadBuilder state(std::uint32_t version = 1, std::size_t size = 26) {
  return PayloadBuilder(0xB80C, size)
      .fill(0xA5)
      .u32(0, version)
      .u8(4, 3)
      .u16(5, 0)
      .bytes(7, {0x32, 0xF4, 0x10})  // 234-01
      .u8(10, 2)
      .bytes(11, {0x09, 0x51, 0x70})  // 901-075
      .u8(14, 202)
      .u16(15, 772)
      .u8(17, 33)
      .u32(18, 0x0BAD'CAFE)
      .u8(22, 0)
      .bytes(23, {0x01, 0x02, 0x03});
}

constexpr std::string_view ofState =
    R"(5GMM State: "Registered", 5GMM Substate: "Normal Service", Update Status: "Updated", PLMN: "234-01", )"
    R"(Tracking Area Code: "66051", AMF PLMN: "901-075", AMF Region: "202", AMF Set: "772", )"
    R"(AMF Pointer: "33", 5G-TMSI: "present"})";

TEST_F(NRRegistrationTest, BothVersionsAreAlike) {
  decode(state().bytes());
  EXPECT_EQ(shown(), R"({Version: "1", )" + std::string(ofState));
  decode(state(0x30000, 27).bytes());
  EXPECT_EQ(shown(), R"({Version: "3.0", )" + std::string(ofState));
}

TEST_F(NRRegistrationTest, TheTemporaryIdentityIsShownWhereIdentitiesAre) {
  Registration decoderOfIdentities(Identities::Shown);
  decoderOfIdentities.updateSectionRef(section);
  decoderOfIdentities.updateWithData_logCode(Packet(state().bytes()), 0xB80C);
  EXPECT_EQ(shown("5G-TMSI"), R"("0x0badcafe")");
}

TEST_F(NRRegistrationTest, AnIdentityOfAnotherTypeEmptiesTheRowsOfTheOld) {
  for (const std::uint8_t type : {0, 1, 3, 4, 7, 255}) {
    decode(state().bytes());
    decode(state().u8(10, type).bytes());
    for (const auto* const row : {"AMF PLMN", "AMF Region", "AMF Set", "AMF Pointer", "5G-TMSI"})
      EXPECT_EQ(shown(row), R"("")") << row << " of type " << int{type};
  }
}

TEST_F(NRRegistrationTest, TheTypeOfTheIdentityHasThreeBits) {
  decode(state().u8(10, 0xF2).bytes());
  EXPECT_EQ(shown("AMF Region"), R"("202")");
}

std::string unknown(int value) { return "Unknown (" + std::to_string(value) + ")"; }

TEST_F(NRRegistrationTest, EachStateHasItsText) {
  const std::map<int, std::string> texts = {
      {1, "Deregistered"}, {2, "Registered Initiated"}, {3, "Registered"}, {4, "Service Request Initiated"}};
  for (int value = 0; value < 256; ++value) {
    decode(state().u8(4, static_cast<std::uint8_t>(value)).bytes());
    EXPECT_EQ(text("5GMM State"), texts.contains(value) ? texts.at(value) : unknown(value));
  }
}

TEST_F(NRRegistrationTest, EachSubstateHasItsText) {
  const std::map<int, std::string> texts = {
      {0, "Normal Service"}, {1, "PLMN Search"}, {2, "No Cell Available"}, {5, "Limited Service"}};
  for (int value = 0; value < 258; ++value) {
    decode(state().u16(5, static_cast<std::uint16_t>(value)).bytes());
    EXPECT_EQ(text("5GMM Substate"), texts.contains(value) ? texts.at(value) : unknown(value));
  }
}

TEST_F(NRRegistrationTest, TheUpdateStatusIsSigned) {
  decode(state().u8(22, 1).bytes());
  EXPECT_EQ(text("Update Status"), "Not Updated");
  decode(state().u8(22, 2).bytes());
  EXPECT_EQ(text("Update Status"), "Unknown (2)");
  decode(state().u8(22, 0xFF).bytes());
  EXPECT_EQ(text("Update Status"), "Unknown (-1)");
}

TEST_F(NRRegistrationTest, WithoutANetworkTheRowIsEmpty) {
  decode(state().bytes(7, {0xFF, 0xFF, 0xFF}).bytes());
  EXPECT_EQ(shown("PLMN"), R"("")");
}

TEST_F(NRRegistrationTest, AnotherVersionIsNotKnown) {
  decode(state(2).bytes());
  EXPECT_EQ(shown(), R"-({Version: "2 (not known)"})-");
}

TEST_F(NRRegistrationTest, ShorterPacketsAreIgnored) {
  expectIgnoredBelow(13 + 26, state().bytes(), 0xB80C, {});
  expectIgnoredBelow(13 + 27, state(0x30000, 27).bytes(), 0xB80C, {});
}

}  // namespace
}  // namespace varnel::nr
