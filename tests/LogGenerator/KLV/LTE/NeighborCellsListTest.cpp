#include "LogGenerator/KLV/LTE/NeighborCellsList.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t measurementCode = 0xB180;
constexpr const char* trace = "<4>Neighbor Cells List";

using NeighborCellsListTest = ListDecoderTest<NeighborCellsList, measurementCode>;

// A measurement of zeros whose two bytes of count are these.
PacketBuilder counted(std::uint8_t byte19, std::uint8_t byte20, std::size_t size) {
  PacketBuilder packet(measurementCode, size);
  packet.u8(19, byte19).u8(20, byte20);
  return packet;
}

// A cell whose fields all differ; all bits that are not shown are set.
void putFirstCell(PacketBuilder& packet, std::size_t at) {
  packet.u8(at, 0x2D)
      .u8(at + 1, 0x37)
      .u8(at + 2, 0xA7)
      .u8(at + 3, 0xFC)
      .u8(at + 4, 0x4F)
      .u8(at + 5, 0x8F)
      .u8(at + 6, 0xC2)
      .u8(at + 7, 0xEA)
      .u16(at + 8, 61453)
      .u8(at + 12, 0xA3)
      .u8(at + 13, 0xBD)
      .u8(at + 14, 0x2D)
      .u8(at + 15, 0xE6);
}

// Two cells: one of distinct fields, one of zeros but for its identity.
Bytes twoCells() {
  PacketBuilder packet(measurementCode, 61);
  packet.fill(0xEE).u8(19, 0x40 | 0x3F).u8(20, 0xF8);
  putFirstCell(packet, 21);
  for (std::size_t offset = 41; offset < 57; ++offset) packet.u8(offset, 0);
  return packet.u8(41, 7).bytes();
}

constexpr const char* first =
    R"({Physical Cell ID: "301", Measured RSSI: "-62.50 dBm", Measured RSRP: "-98.50 dBm", )"
    R"(Average RSRP: "27.50 dBm", Measured RSRQ: "-12.25 dB", Average RSRQ: "-13.50 dB", Srxlev: "55 dBm", )"
    R"(Frequency Offset: "61453", Ant 0 Frame Offset: "1443", Ant 0 Sample Offset: "312759", )"
    R"(Ant 1 Frame Offset: "1443", Ant 1 Sample Offset: "312759"})";
constexpr const char* second =
    R"({Physical Cell ID: "7", Measured RSSI: "-140.00 dBm", Measured RSRP: "-140.00 dBm", )"
    R"(Average RSRP: "-140.00 dBm", Measured RSRQ: "-30.00 dB", Average RSRQ: "-30.00 dB", Srxlev: "-30 dBm", )"
    R"(Frequency Offset: "0", Ant 0 Frame Offset: "0", Ant 0 Sample Offset: "0", )"
    R"(Ant 1 Frame Offset: "0", Ant 1 Sample Offset: "0"})";

// The lines of a measurement of that count, followed by the lines of as many of the two cells.
std::vector<std::string> linesOf(const char* countLine, std::size_t cells) {
  std::vector<std::string> lines = {trace, countLine};
  if (cells > 0) {
    lines.insert(lines.end(), {"<4>Physical Cell ID: 301\n", "<4>Measured RSSI: -62.500000\n",
                               "<4>Measured RSSI: -98.500000\n", "<4>Measured RSSI: 27.500000\n",
                               "<4>Measured RSSI: -12.250000\n", "<4>Measured RSSI: -13.500000\n"});
  }
  if (cells > 1) {
    lines.insert(lines.end(), {"<4>Physical Cell ID: 7\n", "<4>Measured RSSI: -140.000000\n",
                               "<4>Measured RSSI: -140.000000\n", "<4>Measured RSSI: -140.000000\n",
                               "<4>Measured RSSI: -30.000000\n", "<4>Measured RSSI: -30.000000\n"});
  }
  return lines;
}

constexpr const char* countOf1 = "<4>Number of neighboring cells being reported: 1\n";
constexpr const char* countOf2 = "<4>Number of neighboring cells being reported: 2\n";

TEST_F(NeighborCellsListTest, EachCellHasTwelveEntriesInThisOrder) {
  decode(twoCells());
  EXPECT_EQ(shown(), listOf({first, second}));
}

TEST_F(NeighborCellsListTest, TheCountIsLoggedThenTheIdentityAndFiveValuesOfEachCell) {
  decode(twoCells());
  EXPECT_EQ(log.takeTexts(), linesOf(countOf2, 2));
}

TEST_F(NeighborCellsListTest, ACountFieldOf0YieldsOneCell) {
  PacketBuilder packet = counted(0, 0, 41);
  putFirstCell(packet, 21);
  decode(packet.bytes());
  EXPECT_EQ(shown(), listOf({first}));
  EXPECT_EQ(log.takeTexts(), linesOf(countOf1, 1));
}

TEST_F(NeighborCellsListTest, ACountFieldOf31YieldsThirtyTwoCells) {
  decode(counted(0xC0, 0x07, 661).u8(21, 1).u8(641, 32).bytes());
  ASSERT_EQ(rowCount(), 32u);
  EXPECT_EQ(described(section.array()->front().dictionary()->get("Physical Cell ID")), R"("1")");
  EXPECT_EQ(described(section.array()->back().dictionary()->get("Physical Cell ID")), R"("32")");
  const std::vector<std::string> lines = log.takeTexts();
  ASSERT_EQ(lines.size(), 194u);
  EXPECT_EQ(lines[1], "<4>Number of neighboring cells being reported: 32\n");
  EXPECT_EQ(lines[188], "<4>Physical Cell ID: 32\n");
}

TEST_F(NeighborCellsListTest, EachBitOfTheCountFieldCountsAndNoOther) {
  const auto count = [&](std::uint8_t byte19, std::uint8_t byte20) {
    decode(counted(byte19, byte20, 661).bytes());
    return rowCount();
  };
  EXPECT_EQ(count(0x40, 0x00), 2u);
  EXPECT_EQ(count(0x80, 0x00), 3u);
  EXPECT_EQ(count(0x00, 0x01), 5u);
  EXPECT_EQ(count(0x00, 0x02), 9u);
  EXPECT_EQ(count(0x00, 0x04), 17u);
  EXPECT_EQ(count(0x3F, 0xF8), 1u);
}

TEST_F(NeighborCellsListTest, AllOnesShowTheHighEndOfEachScale) {
  decode(counted(0, 0, 41).fill(0xFF).u8(19, 0x3F).u8(20, 0xF8).bytes());
  EXPECT_EQ(
      shown(),
      R"([{Physical Cell ID: "511", Measured RSSI: "-12.50 dBm", Measured RSRP: "115.50 dBm", )"
      R"(Average RSRP: "115.50 dBm", Measured RSRQ: "1.75 dB", Average RSRQ: "1.75 dB", Srxlev: "97 dBm", )"
      R"(Frequency Offset: "65535", Ant 0 Frame Offset: "2047", Ant 0 Sample Offset: "524287", )"
      R"(Ant 1 Frame Offset: "2047", Ant 1 Sample Offset: "524287"}])");
}

TEST_F(NeighborCellsListTest, AntennaOneAlwaysShowsTheOffsetsOfAntennaZero) {
  for (const std::size_t byte : {12, 13, 14, 15, 16, 17, 18, 19}) {
    decode(counted(0, 0, 41).u16(33, 0xBDA3).u16(35, 0xE62D).u8(21 + byte, 0x5A).bytes());
    EXPECT_EQ(shown("Ant 1 Frame Offset"), shown("Ant 0 Frame Offset")) << "byte " << byte;
    EXPECT_EQ(shown("Ant 1 Sample Offset"), shown("Ant 0 Sample Offset")) << "byte " << byte;
    if (byte < 16) continue;
    EXPECT_EQ(shown("Ant 1 Frame Offset"), R"("1443")") << "byte " << byte;
    EXPECT_EQ(shown("Ant 1 Sample Offset"), R"("312759")") << "byte " << byte;
  }
}

TEST_F(NeighborCellsListTest, EachBitCountsInItsOwnEntriesAlone) {
  const std::vector<std::string_view> rsrp = {"-139.50 dBm", "-139.00 dBm", "-138.00 dBm",
                                              "-136.00 dBm", "-132.00 dBm", "-124.00 dBm",
                                              "-108.00 dBm", "-76.00 dBm",  "-12.00 dBm"};
  const std::vector<std::string_view> rsrq = {"-29.75 dB", "-29.50 dB", "-29.00 dB", "-28.00 dB",
                                              "-26.00 dB", "-22.00 dB", "-14.00 dB"};
  const std::vector<std::string_view> frameOffset = {"1",  "2",   "4",   "8",   "16",  "32",
                                                     "64", "128", "256", "512", "1024"};
  const std::vector<std::string_view> sampleOffset = {
      "1",    "2",    "4",    "8",    "16",    "32",    "64",    "128",    "256",   "512",
      "1024", "2048", "4096", "8192", "16384", "32768", "65536", "131072", "262144"};
  expectTextsOfSingleBits(
      counted(0, 0, 41).bytes(), 21, 41,
      {{"Physical Cell ID", 21, 0, "0", {"1", "2", "4", "8", "16", "32", "64", "128", "256"}},
       {"Measured RSSI",
        22,
        1,
        "-140.00 dBm",
        {"-139.50 dBm", "-139.00 dBm", "-138.00 dBm", "-136.00 dBm", "-132.00 dBm", "-124.00 dBm",
         "-108.00 dBm", "-76.00 dBm"}},
       {"Measured RSRP", 23, 1, "-140.00 dBm", rsrp},
       {"Average RSRP", 25, 0, "-140.00 dBm", rsrp},
       {"Measured RSRQ", 26, 1, "-30.00 dB", rsrq},
       {"Average RSRQ", 27, 0, "-30.00 dB", rsrq},
       {"Srxlev",
        27,
        7,
        "-30 dBm",
        {"-29 dBm", "-28 dBm", "-26 dBm", "-22 dBm", "-14 dBm", "2 dBm", "34 dBm"}},
       {"Frequency Offset",
        29,
        0,
        "0",
        {"1", "2", "4", "8", "16", "32", "64", "128", "256", "512", "1024", "2048", "4096", "8192", "16384",
         "32768"}},
       {"Ant 0 Frame Offset", 33, 0, "0", frameOffset},
       {"Ant 0 Sample Offset", 34, 3, "0", sampleOffset},
       {"Ant 1 Frame Offset", 33, 0, "0", frameOffset},
       {"Ant 1 Sample Offset", 34, 3, "0", sampleOffset}});
}

TEST_F(NeighborCellsListTest, EachMeasurementReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(twoCells());
  EXPECT_EQ(rowCount(), 2u);
  PacketBuilder packet = counted(0, 0, 41);
  putFirstCell(packet, 21);
  decode(packet.bytes());
  EXPECT_EQ(shown(), listOf({first}));
}

TEST_F(NeighborCellsListTest, ARecordMayEndWithItsSixteenthByte) {
  Bytes packet = twoCells();
  packet.resize(57);
  decode(packet);
  EXPECT_EQ(shown(), listOf({first, second}));
  packet.resize(56);
  decode(packet);
  EXPECT_EQ(shown(), listOf({first}));
}

TEST_F(NeighborCellsListTest, RecordsBeyondThePacketLeaveAnEmptyListAndTheCountIsLoggedInFull) {
  putOldContent();
  decode(counted(0xC0, 0x07, 36).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, "<4>Number of neighboring cells being reported: 32\n"));
}

TEST_F(NeighborCellsListTest, EveryTruncatedMeasurementKeepsAndLogsItsWholeRecords) {
  forEachTruncation(twoCells(), [&](std::size_t size, const std::vector<std::string>& lines) {
    if (size < 21) {
      EXPECT_EQ(shown(), oldContent());
      EXPECT_THAT(lines, ElementsAre(trace));
    } else if (size < 37) {
      EXPECT_EQ(shown(), "[]");
      EXPECT_EQ(lines, linesOf(countOf2, 0));
    } else if (size < 57) {
      EXPECT_EQ(shown(), listOf({first}));
      EXPECT_EQ(lines, linesOf(countOf2, 1));
    } else {
      EXPECT_EQ(shown(), listOf({first, second}));
      EXPECT_EQ(lines, linesOf(countOf2, 2));
    }
  });
}

TEST_F(NeighborCellsListTest, MeasurementsOf21And22BytesAreAccepted) {
  for (const std::size_t size : {21u, 22u}) {
    putOldContent();
    decode(counted(0, 0, size).bytes());
    EXPECT_EQ(shown(), "[]") << size << " bytes";
    EXPECT_THAT(log.takeTexts(), ElementsAre(trace, countOf1)) << size << " bytes";
  }
}

}  // namespace
}  // namespace varnel
