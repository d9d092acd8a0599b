#include "LogGenerator/KLV/UTRAN/CCTRCHSIRMeasurement.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t channelsCode = 0xD00C;
constexpr const char* trace = "<4>CCTRCH SIR Measurement";

using CCTRCHSIRMeasurementTest = ListDecoderTest<CCTRCHSIRMeasurement, channelsCode>;

// A packet of zeros with these two count bytes.
PacketBuilder counted(std::uint8_t byte14, std::uint8_t byte15, std::size_t size) {
  PacketBuilder packet(channelsCode, size);
  packet.u8(14, byte14).u8(15, byte15);
  return packet;
}

// Two composite channels behind two transport channels, among other bytes that must not be shown.
Bytes twoChannels() {
  return PacketBuilder(channelsCode, 373)
      .fill(0xEE)
      .u8(14, 0xBF)
      .u8(15, 0x20)
      .u32(357, 0x04030201)
      .u32(361, 0x08070605)
      .u32(365, 0xFC00FE09)
      .u32(369, 0x7F8081FB)
      .bytes();
}

constexpr const char* first = R"({CCTRCH ID: "1", TSNUM: "2", SIR: ["3", "4", "5", "6", "7", "8"]})";
constexpr const char* second =
    R"({CCTRCH ID: "9", TSNUM: "254", SIR: ["0", "252", "251", "129", "128", "127"]})";
constexpr const char* zeros = R"({CCTRCH ID: "0", TSNUM: "0", SIR: ["0", "0", "0", "0", "0", "0"]})";

TEST_F(CCTRCHSIRMeasurementTest, EachOfTwoChannelsHasTwoEntriesAndAListOfSixRatios) {
  decode(twoChannels());
  EXPECT_EQ(shown(), listOf({first, second}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(CCTRCHSIRMeasurementTest, WithoutTransportChannelsTheyBeginAtByte289) {
  decode(counted(0, 0x10, 297).u32(289, 0x04030201).u32(293, 0x08070605).bytes());
  EXPECT_EQ(shown(), listOf({first}));
}

TEST_F(CCTRCHSIRMeasurementTest, EachTransportChannelMovesThemBy34Bytes) {
  decode(counted(0x40, 0x10, 331).u32(323, 0x04030201).u32(327, 0x08070605).bytes());
  EXPECT_EQ(shown(), listOf({first}));
  decode(counted(0x00, 0x11, 433).u32(425, 0x04030201).u32(429, 0x08070605).bytes());
  EXPECT_EQ(shown(), listOf({first}));
  decode(counted(0xC0, 0x1F, 2439).u32(2431, 0x04030201).u32(2435, 0x08070605).bytes());
  EXPECT_EQ(shown(), listOf({first}));
}

TEST_F(CCTRCHSIRMeasurementTest, EachBitCountsInItsOwnEntryAlone) {
  const std::vector<std::string_view> byte = {"1", "2", "4", "8", "16", "32", "64", "128"};
  expectTextsOfSingleBits(counted(0, 0x10, 305).bytes(), 289, 291,
                          {{"CCTRCH ID", 289, 0, "0", byte}, {"TSNUM", 290, 0, "0", byte}});
}

TEST_F(CCTRCHSIRMeasurementTest, AllOnesAreShownUnsigned) {
  decode(counted(0, 0x10, 297).fill(0xFF).u8(14, 0x3F).u8(15, 0x10).bytes());
  EXPECT_EQ(shown(),
            R"([{CCTRCH ID: "255", TSNUM: "255", SIR: ["255", "255", "255", "255", "255", "255"]}])");
}

TEST_F(CCTRCHSIRMeasurementTest, EachBitOfTheCompositeChannelCountCountsAndNoOther) {
  const auto count = [&](std::uint8_t byte15) {
    decode(counted(0xFF, byte15, 2551).u8(16, 0xFF).bytes());
    return rowCount();
  };
  EXPECT_EQ(count(0x10), 1u);
  EXPECT_EQ(count(0x20), 2u);
  EXPECT_EQ(count(0x40), 4u);
  EXPECT_EQ(count(0x80), 8u);
  EXPECT_EQ(count(0x0F), 0u);
}

TEST_F(CCTRCHSIRMeasurementTest, FifteenChannelsBehind63TransportChannelsAreAllShown) {
  decode(counted(0xC0, 0xFF, 2551).u8(2431, 1).u8(2543, 15).bytes());
  ASSERT_EQ(rowCount(), 15u);
  EXPECT_EQ(described(section.array()->front().dictionary()->get("CCTRCH ID")), R"("1")");
  EXPECT_EQ(described(section.array()->back().dictionary()->get("CCTRCH ID")), R"("15")");
}

TEST_F(CCTRCHSIRMeasurementTest, EachPacketReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(twoChannels());
  EXPECT_EQ(shown(), listOf({first, second}));
  decode(counted(0, 0x10, 297).bytes());
  EXPECT_EQ(shown(), listOf({zeros}));
}

TEST_F(CCTRCHSIRMeasurementTest, ACountOf0EmptiesTheListSilently) {
  putOldContent();
  decode(counted(0xC0, 0x0F, 2551).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(CCTRCHSIRMeasurementTest, RecordsBeyondThePacketLeaveAnEmptyListSilently) {
  putOldContent();
  decode(counted(0xC0, 0xFF, 17).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(CCTRCHSIRMeasurementTest, EveryTruncatedPacketKeepsItsWholeRecords) {
  forEachTruncation(twoChannels(), [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string expected = listOf({first});
    if (size < 365) expected = "[]";
    if (size < 17) expected = oldContent();
    EXPECT_EQ(shown(), expected);
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

TEST_F(CCTRCHSIRMeasurementTest, PacketsOf17And18BytesAreAccepted) {
  for (const std::size_t size : {17u, 18u}) {
    putOldContent();
    decode(counted(0, 0, size).bytes());
    EXPECT_EQ(shown(), "[]") << size << " bytes";
  }
}

}  // namespace
}  // namespace varnel
