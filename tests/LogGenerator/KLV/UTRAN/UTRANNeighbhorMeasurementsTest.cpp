#include "LogGenerator/KLV/UTRAN/UTRANNeighbhorMeasurements.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t neighborsCode = 0xD00A;
constexpr const char* trace = "<4>NeighbhorMeasurements List";

using UTRANNeighbhorMeasurementsTest = ListDecoderTest<UTRANNeighbhorMeasurements, neighborsCode>;

// A packet of zeros with this count byte.
PacketBuilder counted(std::uint8_t byte16, std::size_t size) {
  PacketBuilder packet(neighborsCode, size);
  packet.u8(16, byte16);
  return packet;
}

// One cell of zeros but for its fourth byte.
Bytes cellOfByte3(std::uint8_t byte3) { return counted(2, 184).u8(171, byte3).bytes(); }

// Two cells whose fields all differ, among other bytes that must not be shown.
Bytes twoCells() {
  return PacketBuilder(neighborsCode, 200)
      .fill(0xEE)
      .u8(16, 0x05)
      .u32(168, 0xB351A943)
      .u32(184, 0x4FE0004D)
      .bytes();
}

constexpr const char* first =
    R"({UARFCN: "10563", Cell ID: "70", Filter RSCP: "0.601562", Status: "MSET", inJDCS: "TRUE"})";
constexpr const char* second =
    R"({UARFCN: "77", Cell ID: "0", Filter RSCP: "0.496094", Status: "DSET", inJDCS: "FALSE"})";

TEST_F(UTRANNeighbhorMeasurementsTest, EachCellHasFiveEntriesInThisOrder) {
  decode(twoCells());
  EXPECT_EQ(shown(), listOf({first, second}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UTRANNeighbhorMeasurementsTest, ZerosShowTheLowEndOfEachScale) {
  decode(counted(2, 184).bytes());
  EXPECT_EQ(shown(),
            R"([{UARFCN: "0", Cell ID: "0", Filter RSCP: "0.000000", Status: "ASET", inJDCS: "FALSE"}])");
}

TEST_F(UTRANNeighbhorMeasurementsTest, AllOnesShowTheHighEndOfEachScaleAndNoStatus) {
  decode(counted(2, 184).u32(168, 0xFFFFFFFF).bytes());
  EXPECT_EQ(shown(), R"([{UARFCN: "16383", Cell ID: "127", Filter RSCP: "0.996094", inJDCS: "TRUE"}])");
}

TEST_F(UTRANNeighbhorMeasurementsTest, EachBitCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(
      counted(2, 184).bytes(), 168, 184,
      {{"UARFCN",
        168,
        0,
        "0",
        {"1", "2", "4", "8", "16", "32", "64", "128", "256", "512", "1024", "2048", "4096", "8192"}},
       {"Cell ID", 169, 6, "0", {"1", "2", "4", "8", "16", "32", "64"}},
       {"Filter RSCP",
        170,
        5,
        "0.000000",
        {"0.003906", "0.007812", "0.015625", "0.031250", "0.062500", "0.125000", "0.250000", "0.500000"}},
       {"Status", 171, 5, "ASET", {"MSET", "DSET"}},
       {"inJDCS", 171, 7, "FALSE", {"TRUE"}}});
}

TEST_F(UTRANNeighbhorMeasurementsTest, ARawRscpOf128Shows0Point500000) {
  decode(cellOfByte3(0x10));
  EXPECT_EQ(shown("Filter RSCP"), R"("0.500000")");
}

TEST_F(UTRANNeighbhorMeasurementsTest, ASetMembershipOf3HasNoStatusButStillItsJdcsEntry) {
  decode(cellOfByte3(0x60));
  EXPECT_EQ(shown(), R"([{UARFCN: "0", Cell ID: "0", Filter RSCP: "0.000000", inJDCS: "FALSE"}])");
  decode(cellOfByte3(0xE0));
  EXPECT_EQ(shown(), R"([{UARFCN: "0", Cell ID: "0", Filter RSCP: "0.000000", inJDCS: "TRUE"}])");
}

TEST_F(UTRANNeighbhorMeasurementsTest, TheOtherThreeSetMembershipsHaveAStatus) {
  decode(cellOfByte3(0x00));
  EXPECT_EQ(shown("Status"), R"("ASET")");
  decode(cellOfByte3(0x20));
  EXPECT_EQ(shown("Status"), R"("MSET")");
  decode(cellOfByte3(0x40));
  EXPECT_EQ(shown("Status"), R"("DSET")");
}

TEST_F(UTRANNeighbhorMeasurementsTest, EachPacketReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(twoCells());
  EXPECT_EQ(shown(), listOf({first, second}));
  decode(counted(2, 172).u8(168, 9).bytes());
  EXPECT_EQ(shown(),
            R"([{UARFCN: "9", Cell ID: "0", Filter RSCP: "0.000000", Status: "ASET", inJDCS: "FALSE"}])");
}

TEST_F(UTRANNeighbhorMeasurementsTest, ACountOf0EmptiesTheListWhateverTheLowestBitIs) {
  putOldContent();
  decode(counted(1, 184).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UTRANNeighbhorMeasurementsTest, EachUpperBitOfTheCountByteCountsAndNoOther) {
  const auto count = [&](std::uint8_t byte16) {
    decode(counted(byte16, 2200).u8(15, 0xFF).u8(17, 0xFF).bytes());
    return rowCount();
  };
  EXPECT_EQ(count(0x02), 1u);
  EXPECT_EQ(count(0x04), 2u);
  EXPECT_EQ(count(0x08), 4u);
  EXPECT_EQ(count(0x10), 8u);
  EXPECT_EQ(count(0x20), 16u);
  EXPECT_EQ(count(0x40), 32u);
  EXPECT_EQ(count(0x80), 64u);
  EXPECT_EQ(count(0x01), 0u);
}

TEST_F(UTRANNeighbhorMeasurementsTest, OneHundredTwentySevenCellsAreAllShown) {
  decode(counted(0xFF, 2188).u8(168, 1).u8(2184, 127).bytes());
  ASSERT_EQ(rowCount(), 127u);
  EXPECT_EQ(described(section.array()->front().dictionary()->get("UARFCN")), R"("1")");
  EXPECT_EQ(described(section.array()->back().dictionary()->get("UARFCN")), R"("127")");
}

TEST_F(UTRANNeighbhorMeasurementsTest, RecordsBeyondThePacketLeaveAnEmptyListSilently) {
  putOldContent();
  decode(counted(0xFE, 171).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UTRANNeighbhorMeasurementsTest, EveryTruncatedPacketKeepsTheRecordsWhoseFirstFourBytesItHolds) {
  forEachTruncation(twoCells(), [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string expected = listOf({first, second});
    if (size < 188) expected = listOf({first});
    if (size < 172) expected = "[]";
    if (size < 21) expected = oldContent();
    EXPECT_EQ(shown(), expected);
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

TEST_F(UTRANNeighbhorMeasurementsTest, PacketsOf21And22BytesAreAccepted) {
  for (const std::size_t size : {21u, 22u}) {
    putOldContent();
    decode(counted(0, size).bytes());
    EXPECT_EQ(shown(), "[]") << size << " bytes";
  }
}

}  // namespace
}  // namespace varnel
