#include "LogGenerator/KLV/UTRAN/GSMNeighbhorMeasurements.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t neighborsCode = 0xD00E;
constexpr const char* trace = "<4>GSM Neighbor Cell List";

using GSMNeighbhorMeasurementsTest = ListDecoderTest<GSMNeighbhorMeasurements, neighborsCode>;

// A packet of zeros with a count of cells.
PacketBuilder counted(std::uint8_t cells, std::size_t size) {
  PacketBuilder packet(neighborsCode, size);
  packet.u8(16, cells);
  return packet;
}

// Two cells whose fields all differ, among other bytes that must not be shown.
Bytes twoCells() {
  return PacketBuilder(neighborsCode, 33)
      .fill(0xEE)
      .u8(16, 2)
      .u16(17, 0x9235)
      .u8(19, 5)
      .u8(20, 6)
      .u16(21, 975)
      .u16(23, 0xFFA9)
      .u16(25, 0x4007)
      .u8(27, 8)
      .u8(28, 9)
      .u16(29, 62)
      .u16(31, 12)
      .bytes();
}

constexpr const char* first =
    R"({Cell ID: "4661", Band Indicator: "0", BSIC Valid: "1", NCC: "5", BCC: "6", ARFCN: "975", RSSI: "-87"})";
constexpr const char* second =
    R"({Cell ID: "7", Band Indicator: "1", BSIC Valid: "0", NCC: "8", BCC: "9", ARFCN: "62", RSSI: "12"})";

TEST_F(GSMNeighbhorMeasurementsTest, EachCellHasSevenEntriesInThisOrder) {
  decode(twoCells());
  EXPECT_EQ(shown(), listOf({first, second}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMNeighbhorMeasurementsTest, AllOnesAreUnsignedButForTheRssi) {
  decode(counted(1, 25).fill(0xFF).u8(16, 1).bytes());
  EXPECT_EQ(shown(), R"([{Cell ID: "16383", Band Indicator: "1", BSIC Valid: "1", NCC: "255", BCC: "255", )"
                     R"(ARFCN: "65535", RSSI: "-1"}])");
}

TEST_F(GSMNeighbhorMeasurementsTest, TheRssiIsSigned) {
  const auto rssi = [&](std::uint16_t raw) {
    decode(counted(1, 25).u16(23, raw).bytes());
    return shown("RSSI");
  };
  EXPECT_EQ(rssi(0xFFFF), R"("-1")");
  EXPECT_EQ(rssi(0x8000), R"("-32768")");
  EXPECT_EQ(rssi(0x7FFF), R"("32767")");
  EXPECT_EQ(rssi(0), R"("0")");
}

TEST_F(GSMNeighbhorMeasurementsTest, EachBitCountsInItsOwnEntryAlone) {
  const std::vector<std::string_view> byte = {"1", "2", "4", "8", "16", "32", "64", "128"};
  expectTextsOfSingleBits(
      counted(1, 33).bytes(), 17, 33,
      {{"Cell ID",
        17,
        0,
        "0",
        {"1", "2", "4", "8", "16", "32", "64", "128", "256", "512", "1024", "2048", "4096", "8192"}},
       {"Band Indicator", 18, 6, "0", {"1"}},
       {"BSIC Valid", 18, 7, "0", {"1"}},
       {"NCC", 19, 0, "0", byte},
       {"BCC", 20, 0, "0", byte},
       {"ARFCN",
        21,
        0,
        "0",
        {"1", "2", "4", "8", "16", "32", "64", "128", "256", "512", "1024", "2048", "4096", "8192", "16384",
         "32768"}},
       {"RSSI",
        23,
        0,
        "0",
        {"1", "2", "4", "8", "16", "32", "64", "128", "256", "512", "1024", "2048", "4096", "8192", "16384",
         "-32768"}}});
}

TEST_F(GSMNeighbhorMeasurementsTest, EachPacketReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(twoCells());
  EXPECT_EQ(shown(), listOf({first, second}));
  decode(counted(1, 25).bytes());
  EXPECT_EQ(shown(), R"([{Cell ID: "0", Band Indicator: "0", BSIC Valid: "0", NCC: "0", BCC: "0", )"
                     R"(ARFCN: "0", RSSI: "0"}])");
}

TEST_F(GSMNeighbhorMeasurementsTest, ACountOf0EmptiesTheListSilently) {
  putOldContent();
  decode(counted(0, 33).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMNeighbhorMeasurementsTest, RecordsBehindTheLastOneThatIsCountedAreNotShown) {
  decode(counted(1, 2057).u8(15, 0xFF).u8(17, 0xFF).bytes());
  EXPECT_EQ(rowCount(), 1u);
}

TEST_F(GSMNeighbhorMeasurementsTest, TwoHundredFiftyFiveCellsAreAllShown) {
  decode(counted(255, 2057).u16(17, 1).u16(2049, 255).bytes());
  ASSERT_EQ(rowCount(), 255u);
  EXPECT_EQ(described(section.array()->front().dictionary()->get("Cell ID")), R"("1")");
  EXPECT_EQ(described(section.array()->back().dictionary()->get("Cell ID")), R"("255")");
}

TEST_F(GSMNeighbhorMeasurementsTest, RecordsBeyondThePacketLeaveAnEmptyListSilently) {
  putOldContent();
  decode(counted(255, 24).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMNeighbhorMeasurementsTest, EveryTruncatedPacketKeepsItsWholeRecords) {
  forEachTruncation(twoCells(), [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string expected = listOf({first});
    if (size < 25) expected = "[]";
    if (size < 17) expected = oldContent();
    EXPECT_EQ(shown(), expected);
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

TEST_F(GSMNeighbhorMeasurementsTest, PacketsOf17And18BytesAreAccepted) {
  for (const std::size_t size : {17u, 18u}) {
    putOldContent();
    decode(counted(0, size).bytes());
    EXPECT_EQ(shown(), "[]") << size << " bytes";
  }
}

}  // namespace
}  // namespace varnel
