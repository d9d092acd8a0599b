#include "LogGenerator/Radios/LTE/Bearers.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "tests/support/Describe.h"
#include "tests/support/PacketBuilder.h"

namespace varnel::lte {
namespace {

constexpr std::size_t header = 13, quality = header + 10;

// A default bearer in use, with nothing but its class 9.
PacketBuilder context(std::uint8_t identity, std::uint8_t state = 2) {
  return PacketBuilder(0xB0E5, header + 20)
      .u8(header, 1)
      .u8(header + 1, 0)
      .u8(header + 2, identity)
      .u8(header + 3, state)
      .u8(quality, 1)
      .u8(quality + 1, 9);
}
PacketBuilder state(std::uint8_t identity, std::uint8_t itsState, std::uint8_t connection = 255) {
  return PacketBuilder(0xB0E4, header + 4)
      .u8(header, 1)
      .u8(header + 1, identity)
      .u8(header + 2, itsState)
      .u8(header + 3, connection);
}

class LTEBearersRows : public testing::Test {
 protected:
  LTEBearersRows() { decoder.updateSectionRef(section); }

  void decode(const PacketBuilder& packet) {
    const Bytes bytes = packet.bytes();
    decoder.updateWithData_logCode(Packet(bytes), Packet(bytes).u16(3));
  }
  std::string contexts() const { return described(section.dictionary()->get("Contexts")); }
  // The maximum uplink rate of a byte and its extension.
  std::string rate(std::uint8_t coded, std::uint8_t extension = 0) {
    decode(context(5).u8(quality, 9).u8(quality + 2, coded).u8(quality + 6, extension));
    const Value record = section.dictionary()->get("Contexts").array()->front();
    return described(record.dictionary()->get("Maximum Rate Uplink"));
  }

  Value section = Value::ofDictionary();
  Bearers decoder;
};

TEST_F(LTEBearersRows, ABearerShowsItsRates) {
  decode(context(7)
             .u8(header + 1, 1)
             .u8(quality, 9)
             .u8(quality + 1, 1)
             .u8(quality + 2, 40)
             .u8(quality + 3, 80)
             .u8(quality + 4, 130)
             .u8(quality + 5, 254)
             .u8(quality + 9, 1));
  EXPECT_EQ(contexts(), R"([{Bearer ID: "7", Type: "Dedicated", State: "Active", QCI: "1", )"
                        R"(Maximum Rate Uplink: "40 kbit/s", Maximum Rate Downlink: "192 kbit/s", )"
                        R"(Guaranteed Rate Uplink: "704 kbit/s", Guaranteed Rate Downlink: "8700 kbit/s"}])");
}

TEST_F(LTEBearersRows, RatesFollowTheStandardsSteps) {
  EXPECT_EQ(rate(1), R"("1 kbit/s")");
  EXPECT_EQ(rate(63), R"("63 kbit/s")");
  EXPECT_EQ(rate(64), R"("64 kbit/s")");
  EXPECT_EQ(rate(127), R"("568 kbit/s")");
  EXPECT_EQ(rate(128), R"("576 kbit/s")");
  EXPECT_EQ(rate(254), R"("8640 kbit/s")");
  EXPECT_EQ(rate(0), "absent");
  EXPECT_EQ(rate(255), "absent");
  EXPECT_EQ(rate(254, 1), R"("8700 kbit/s")");
  EXPECT_EQ(rate(254, 74), R"("16000 kbit/s")");
  EXPECT_EQ(rate(254, 75), R"("17000 kbit/s")");
  EXPECT_EQ(rate(254, 186), R"("128000 kbit/s")");
  EXPECT_EQ(rate(254, 187), R"("130000 kbit/s")");
  EXPECT_EQ(rate(254, 250), R"("256000 kbit/s")");
  EXPECT_EQ(rate(254, 251), "absent");
}

TEST_F(LTEBearersRows, BytesBehindTheLengthOfTheQualityAreNone) {
  const auto withLength = [&](std::uint8_t length) {
    decode(context(5)
               .fill(200)
               .u8(header, 1)
               .u8(header + 1, 0)
               .u8(header + 2, 5)
               .u8(header + 3, 2)
               .u8(quality, length));
    return section.dictionary()->get("Contexts").array()->front().dictionary()->size();
  };
  EXPECT_EQ(withLength(0), 3U);
  EXPECT_EQ(withLength(1), 4U);
  EXPECT_EQ(withLength(2), 5U);
  EXPECT_EQ(withLength(3), 6U);
  EXPECT_EQ(withLength(5), 8U);
  EXPECT_EQ(withLength(9), 8U);
  EXPECT_EQ(withLength(255), 8U);
}

TEST_F(LTEBearersRows, BearersStandInTheOrderOfTheirIdentities) {
  decode(context(10));
  decode(context(6));
  decode(context(9));
  decode(context(6, 3));
  EXPECT_EQ(contexts(), R"([{Bearer ID: "6", Type: "Default", State: "Modify Pending", QCI: "9"}, )"
                        R"({Bearer ID: "9", Type: "Default", State: "Active", QCI: "9"}, )"
                        R"({Bearer ID: "10", Type: "Default", State: "Active", QCI: "9"}])");
}

TEST_F(LTEBearersRows, TheStateAndTheConnectionComeFromAPacketOfTheirOwn) {
  decode(state(5, 1));
  EXPECT_EQ(contexts(), R"([{Bearer ID: "5", State: "Active Pending"}])");
  decode(state(5, 2, 3));
  decode(context(5));
  EXPECT_EQ(contexts(),
            R"([{Bearer ID: "5", Type: "Default", State: "Active", QCI: "9", Connection ID: "3"}])");
  decode(state(5, 4));
  EXPECT_EQ(contexts(), R"-([{Bearer ID: "5", Type: "Default", State: "Unknown (4)", QCI: "9"}])-");
}

TEST_F(LTEBearersRows, AnInactiveBearerGoes) {
  decode(context(5));
  decode(context(6));
  decode(state(5, 0));
  EXPECT_EQ(contexts(), R"([{Bearer ID: "6", Type: "Default", State: "Active", QCI: "9"}])");
  decode(context(6, 0));
  EXPECT_EQ(contexts(), "[]");
  decode(context(7, 0));
  decode(state(8, 0));
  EXPECT_EQ(contexts(), "[]");
}

TEST_F(LTEBearersRows, ABearerWithoutATypeLeavesItOut) {
  decode(context(5).u8(header + 1, 255));
  EXPECT_EQ(contexts(), R"([{Bearer ID: "5", State: "Active", QCI: "9"}])");
}

TEST_F(LTEBearersRows, AfterAReconnectionTheShownBearersStay) {
  decode(context(5));
  Bearers next;
  next.updateSectionRef(section);
  next.updateWithData_logCode(Packet(context(6).bytes()), 0xB0E5);
  EXPECT_EQ(section.dictionary()->get("Contexts").array()->size(), 2U);
}

TEST_F(LTEBearersRows, AShownListIsNeverChangedUnderItsReader) {
  decode(context(5));
  const Value earlier = section.dictionary()->get("Contexts");
  decode(state(5, 0));
  EXPECT_EQ(described(earlier), R"([{Bearer ID: "5", Type: "Default", State: "Active", QCI: "9"}])");
}

TEST_F(LTEBearersRows, ShortPacketsChangeNothing) {
  for (const Bytes& whole : {context(5).bytes(), state(5, 1).bytes()}) {
    for (std::size_t size = 0; size < whole.size(); ++size)
      decoder.updateWithData_logCode(Packet(ByteView(whole).first(size)), Packet(whole).u16(3));
  }
  EXPECT_EQ(described(section), "{}");
}

TEST_F(LTEBearersRows, WithoutASectionNothingHappens) {
  Bearers alone;
  alone.updateWithData_logCode(Packet(context(5).bytes()), 0xB0E5);
  EXPECT_EQ(described(section), "{}");
}

TEST_F(LTEBearersRows, RatesListTheirUnit) {
  NumberFormats formats;
  SectionFormats sectionFormats(formats, "Bearers");
  decoder.listNumberFormats(sectionFormats);
  EXPECT_EQ(formats.unit(std::vector<std::string>{"Bearers", "Contexts", "0", "Guaranteed Rate Uplink"}),
            "kbit/s");
}

}  // namespace
}  // namespace varnel::lte
