#include "LogGenerator/KLV/UTRAN/TRCHBLERMeasurement.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t channelsCode = 0xD00C;
constexpr const char* trace = "<5>TRCH BLER Measurement";

using TRCHBLERMeasurementTest = ListDecoderTest<TRCHBLERMeasurement, channelsCode>;

// A packet of zeros with these two count bytes.
PacketBuilder counted(std::uint8_t byte14, std::uint8_t byte15, std::size_t size) {
  PacketBuilder packet(channelsCode, size);
  packet.u8(14, byte14).u8(15, byte15);
  return packet;
}

// Three channels, among other bytes that must not be shown.
Bytes threeChannels() {
  return PacketBuilder(channelsCode, 23)
      .fill(0xEE)
      .u8(14, 0xFF)
      .u8(15, 0xF0)
      .u8(17, 1)
      .u8(18, 63)
      .u8(19, 254)
      .u8(20, 0)
      .u8(21, 3)
      .u8(22, 128)
      .bytes();
}

constexpr const char* first = R"({TRCH ID: "1", TRCH BLER Measurement: "63"})";
constexpr const char* second = R"({TRCH ID: "254", TRCH BLER Measurement: "0"})";
constexpr const char* third = R"({TRCH ID: "3", TRCH BLER Measurement: "128"})";

TEST_F(TRCHBLERMeasurementTest, EachChannelHasTwoEntriesInThisOrderAndTheTraceLineIsANotice) {
  decode(threeChannels());
  EXPECT_EQ(shown(), listOf({first, second, third}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(TRCHBLERMeasurementTest, EachBitCountsInItsOwnEntryAlone) {
  const std::vector<std::string_view> byte = {"1", "2", "4", "8", "16", "32", "64", "128"};
  expectTextsOfSingleBits(counted(0x40, 0, 21).bytes(), 17, 21,
                          {{"TRCH ID", 17, 0, "0", byte}, {"TRCH BLER Measurement", 18, 0, "0", byte}});
}

TEST_F(TRCHBLERMeasurementTest, AllOnesAreShownUnsigned) {
  decode(counted(0x40, 0, 19).u16(17, 0xFFFF).bytes());
  EXPECT_EQ(shown(), R"([{TRCH ID: "255", TRCH BLER Measurement: "255"}])");
}

TEST_F(TRCHBLERMeasurementTest, EachBitOfTheChannelCountCountsAndNoOther) {
  const auto count = [&](std::uint8_t byte14, std::uint8_t byte15) {
    decode(counted(byte14, byte15, 2551).bytes());
    return rowCount();
  };
  EXPECT_EQ(count(0x40, 0x00), 1u);
  EXPECT_EQ(count(0x80, 0x00), 2u);
  EXPECT_EQ(count(0x00, 0x01), 4u);
  EXPECT_EQ(count(0x00, 0x02), 8u);
  EXPECT_EQ(count(0x00, 0x04), 16u);
  EXPECT_EQ(count(0x00, 0x08), 32u);
  EXPECT_EQ(count(0x3F, 0xF0), 0u);
}

TEST_F(TRCHBLERMeasurementTest, SixtyThreeChannelsAreAllShown) {
  decode(counted(0xC0, 0x0F, 143).u8(17, 1).u8(141, 63).bytes());
  ASSERT_EQ(rowCount(), 63u);
  EXPECT_EQ(described(section.array()->front()), R"({TRCH ID: "1", TRCH BLER Measurement: "0"})");
  EXPECT_EQ(described(section.array()->back()), R"({TRCH ID: "63", TRCH BLER Measurement: "0"})");
}

TEST_F(TRCHBLERMeasurementTest, EachPacketReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(threeChannels());
  EXPECT_EQ(shown(), listOf({first, second, third}));
  decode(counted(0x40, 0, 19).u8(17, 9).bytes());
  EXPECT_EQ(shown(), R"([{TRCH ID: "9", TRCH BLER Measurement: "0"}])");
}

TEST_F(TRCHBLERMeasurementTest, ACountOf0EmptiesTheListSilently) {
  putOldContent();
  decode(counted(0, 0, 19).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(TRCHBLERMeasurementTest, RecordsBeyondThePacketLeaveAnEmptyListSilently) {
  putOldContent();
  decode(counted(0xC0, 0x0F, 18).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(TRCHBLERMeasurementTest, EveryTruncatedPacketKeepsItsWholeRecords) {
  forEachTruncation(threeChannels(), [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string expected = listOf({first, second});
    if (size < 21) expected = listOf({first});
    if (size < 19) expected = "[]";
    if (size < 17) expected = oldContent();
    EXPECT_EQ(shown(), expected);
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

TEST_F(TRCHBLERMeasurementTest, PacketsOf17And18BytesAreAccepted) {
  for (const std::size_t size : {17u, 18u}) {
    putOldContent();
    decode(counted(0, 0, size).bytes());
    EXPECT_EQ(shown(), "[]") << size << " bytes";
  }
}

}  // namespace
}  // namespace varnel
