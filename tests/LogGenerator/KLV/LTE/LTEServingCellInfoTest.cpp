#include "LogGenerator/KLV/LTE/LTEServingCellInfo.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t identityCode = 0xB0C2;
constexpr std::uint32_t antennasCode = 0xB0C1;

constexpr const char* trace = "<4>LTE Serving Cell Info";
constexpr const char* unknownAntennas = "<3>Received an unknown log message: 45249";
constexpr const char* failedParse = "<3>Cell Info Array data could not be constructed";
constexpr const char* noArray = "<3>Failed to get Cell Array\n";

class LTEServingCellInfoTest : public testing::Test {
 protected:
  LTEServingCellInfoTest() {
    decoder.updateSectionRef(section);
    log.take();
  }

  void decode(const Bytes& bytes, std::uint32_t logCode) {
    decoder.updateWithData_logCode(Packet(bytes), logCode);
  }
  void decodeCells(Array records) {
    decode(serverMessage(0xFF0001, Value::ofArray(std::move(records))), 0xFF0001);
  }
  std::string shown() const { return described(section); }
  std::string shown(std::string_view row) const { return described(section.dictionary()->get(row)); }

  RecordingLog log;
  LTEServingCellInfo decoder;
  Value section = Value::ofDictionary();
};

// A packet whose fields all differ, among other bytes that must not be shown.
Bytes identity(std::size_t size = 38) {
  return PacketBuilder(identityCode, size)
      .fill(0xEE)
      .u16(14, 301)
      .u16(16, 1300)
      .u16(18, 19300)
      .u8(20, 50)
      .u8(21, 100)
      .u32(22, 26885891)
      .u16(26, 40001)
      .u32(28, 3)
      .bytes();
}

constexpr const char* identityRows =
    R"({Physical Cell ID: "301", Download Frequency: "1300", Upload Frequency: "19300", )"
    R"(Download Bandwidth: "10 MHz", Upload Bandwidth: "20 MHz", Cell Identity: "26885891", )"
    R"(Tracking Area Code: "40001", Freq Band Indicator: "3"})";

Bytes antennas(std::uint8_t number, std::size_t size = 22) {
  return PacketBuilder(antennasCode, size).fill(0xEE).u8(20, number).bytes();
}

Value cell(const char* technology, const char* type, std::int64_t uarfcn) {
  return dictionaryOf({{"RadioAccessTechnology", technology},
                       {"CellType", type},
                       {"UARFCN", Value::ofInteger(uarfcn)},
                       {"TrackingAreaCode", Value::ofInteger(40002)},
                       {"PhysicalCellIdentity", Value::ofInteger(302)},
                       {"BandInfo", Value::ofInteger(7)},
                       {"CellIdentity", Value::ofInteger(26885892)}});
}

constexpr const char* cellRows =
    R"({Tracking Area Code: "40002", Cell Identity: "26885892", Physical Cell ID: "302", )"
    R"(Freq Band Indicator: "7", UARFCN: "3350"})";

TEST_F(LTEServingCellInfoTest, TheCodeThatCountsIsTheGivenOneNotTheHeaders) {
  decode(identity(), antennasCode);
  EXPECT_EQ(shown(), R"({Num Tx Antennas: "50"})");
}

TEST_F(LTEServingCellInfoTest, AnIdentityPacketShowsEightEntriesInThisOrder) {
  decode(identity(), identityCode);
  EXPECT_EQ(shown(), identityRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(LTEServingCellInfoTest, AnIdentityPacketOf39BytesShowsTheSameAsOneOf38) {
  decode(identity(39), identityCode);
  EXPECT_EQ(shown(), identityRows);
}

TEST_F(LTEServingCellInfoTest, EveryTruncatedIdentityPacketIsDroppedSilently) {
  section.dictionary()->set("UARFCN", "3350");
  Bytes packet = identity();
  while (!packet.empty()) {
    packet.pop_back();
    decode(packet, identityCode);
    EXPECT_EQ(shown(), R"({UARFCN: "3350"})") << packet.size() << " bytes";
    EXPECT_THAT(log.takeTexts(), ElementsAre(trace)) << packet.size() << " bytes";
  }
}

TEST_F(LTEServingCellInfoTest, WidthsOfIdentityFieldsAreReadInFull) {
  decode(PacketBuilder(identityCode, 38).fill(0xFF).bytes(), identityCode);
  EXPECT_EQ(shown(), R"({Physical Cell ID: "65535", Download Frequency: "65535", Upload Frequency: "65535", )"
                     R"(Download Bandwidth: "Unknown", Upload Bandwidth: "Unknown", Cell Identity: "-1", )"
                     R"(Tracking Area Code: "65535", Freq Band Indicator: "-1"})");
}

TEST_F(LTEServingCellInfoTest, IdentityFieldsAreLittleEndian) {
  Bytes packet(38);
  for (std::uint8_t i = 13; i < 38; ++i) packet[i] = i;
  decode(packet, identityCode);
  EXPECT_EQ(shown(),
            R"({Physical Cell ID: "3854", Download Frequency: "4368", Upload Frequency: "4882", )"
            R"(Download Bandwidth: "Unknown", Upload Bandwidth: "Unknown", Cell Identity: "421009174", )"
            R"(Tracking Area Code: "6938", Freq Band Indicator: "522067228"})");
}

TEST_F(LTEServingCellInfoTest, ACellIdentityOfAllOnesShowsMinusOne) {
  decode(PacketBuilder(identityCode, 38).u32(22, 0xFFFFFFFF).bytes(), identityCode);
  EXPECT_EQ(shown("Cell Identity"), R"("-1")");
  decode(PacketBuilder(identityCode, 38).u32(22, 0x80000000).bytes(), identityCode);
  EXPECT_EQ(shown("Cell Identity"), R"("-2147483648")");
}

TEST_F(LTEServingCellInfoTest, DownlinkBandwidth6AndUplinkBandwidth7ShowTheFirstOnly) {
  decode(PacketBuilder(identityCode, 38).u8(20, 6).u8(21, 7).bytes(), identityCode);
  EXPECT_EQ(shown("Download Bandwidth"), R"("1.4 MHz")");
  EXPECT_EQ(shown("Upload Bandwidth"), R"("Unknown")");
}

TEST_F(LTEServingCellInfoTest, EachBandwidthHasItsTextAndAllOthersAreUnknown) {
  for (unsigned blocks = 0; blocks < 256; ++blocks) {
    const char* text = R"("Unknown")";
    if (blocks == 6) text = R"("1.4 MHz")";
    if (blocks == 15) text = R"("3 MHz")";
    if (blocks == 25) text = R"("5 MHz")";
    if (blocks == 50) text = R"("10 MHz")";
    if (blocks == 75) text = R"("15 MHz")";
    if (blocks == 100) text = R"("20 MHz")";
    const auto raw = static_cast<std::uint8_t>(blocks);
    const auto other = static_cast<std::uint8_t>(blocks == 25 ? 6 : 25);
    decode(PacketBuilder(identityCode, 38).u8(20, raw).u8(21, other).bytes(), identityCode);
    EXPECT_EQ(shown("Download Bandwidth"), text) << blocks;
    decode(PacketBuilder(identityCode, 38).u8(20, other).u8(21, raw).bytes(), identityCode);
    EXPECT_EQ(shown("Upload Bandwidth"), text) << blocks;
  }
}

TEST_F(LTEServingCellInfoTest, AnIdentityPacketRemovesTheUarfcnOfACellMonitorMessage) {
  decodeCells({cell("LTE", "Serving", 3350)});
  EXPECT_EQ(shown("UARFCN"), R"("3350")");
  decode(identity(), identityCode);
  EXPECT_FALSE(section.dictionary()->has("UARFCN"));
  decodeCells({cell("LTE", "Serving", 3351)});
  EXPECT_EQ(shown("UARFCN"), R"("3351")");
}

TEST_F(LTEServingCellInfoTest, AnIdentityPacketRemovesTheUarfcnEntryOfTheTemplate) {
  section.dictionary()->set("UARFCN", "");
  decode(identity(), identityCode);
  EXPECT_EQ(shown(), identityRows);
}

TEST_F(LTEServingCellInfoTest, AnAntennasPacketShowsTheirNumberAndStillLogsTheCodeAsUnknown) {
  decode(antennas(2), antennasCode);
  EXPECT_EQ(shown(), R"({Num Tx Antennas: "2"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, unknownAntennas));
}

TEST_F(LTEServingCellInfoTest, TheNumberOfAntennasIsAnUnsignedByte) {
  decode(antennas(255), antennasCode);
  EXPECT_EQ(shown(), R"({Num Tx Antennas: "255"})");
}

TEST_F(LTEServingCellInfoTest, AnAntennasPacketOf23BytesShowsTheSameAsOneOf22) {
  decode(antennas(4, 23), antennasCode);
  EXPECT_EQ(shown(), R"({Num Tx Antennas: "4"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, unknownAntennas));
}

TEST_F(LTEServingCellInfoTest, ACellMonitorArrayShowsFiveEntriesInThisOrder) {
  decodeCells({cell("LTE", "Serving", 3350)});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(LTEServingCellInfoTest, TheFirstServingLTECellIsTaken) {
  decodeCells({"no record", cell("LTE", "Neighbor", 1), cell("GSM", "Serving", 2), cell("UMTS", "Serving", 3),
               cell("UTRAN", "Serving", 4), dictionaryOf({{"CellType", "Serving"}}),
               dictionaryOf({{"RadioAccessTechnology", "LTE"}}), Value::ofArray(),
               cell("LTE", "Serving", 3350), cell("LTE", "Serving", 3351)});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(LTEServingCellInfoTest, TheFirstServingLTECellIsTakenThoughALaterOneHasMore) {
  decodeCells({dictionaryOf({{"RadioAccessTechnology", "LTE"}, {"CellType", "Serving"}}),
               cell("LTE", "Serving", 3350)});
  EXPECT_EQ(shown(), "{}");
}

TEST_F(LTEServingCellInfoTest, AnArrayWhoseOnlyLTEEntryIsANeighborChangesNothing) {
  section.dictionary()->set("UARFCN", "old");
  decodeCells({cell("LTE", "Neighbor", 3350), cell("GSM", "Serving", 62)});
  EXPECT_EQ(shown(), R"({UARFCN: "old"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(LTEServingCellInfoTest, AnEmptyArrayChangesNothingSilently) {
  decodeCells({});
  EXPECT_EQ(shown(), "{}");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(LTEServingCellInfoTest, ValuesThatAreMissingAreReportedInOrderAndKeepTheirEntries) {
  decode(identity(), identityCode);
  log.take();
  decodeCells({dictionaryOf({{"RadioAccessTechnology", "LTE"}, {"CellType", "Serving"}})});
  EXPECT_EQ(shown(), identityRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, "<3>Serving Cell Info: Failed to retrieve TAC\n",
                                           "<3>Serving Cell Info: Failed to retrieve Cell ID\n",
                                           "<3>Serving Cell Info: Failed to retrieve Physical Cell ID\n",
                                           "<3>Serving Cell Info: Failed to retrieve Freq Band Indicator\n",
                                           "<3>Serving Cell Info: Failed to retrieve UARFCN\n"));
}

TEST_F(LTEServingCellInfoTest, AnEntryThatIsNoNumberIsReportedAndTheNextOnesAreShown) {
  const Value record = cell("LTE", "Serving", 3350);
  record.dictionary()->set("CellIdentity", "26885892");
  record.dictionary()->set("BandInfo", Value::ofBoolean(true));
  decodeCells({record});
  EXPECT_EQ(shown(), R"({Tracking Area Code: "40002", Physical Cell ID: "302", UARFCN: "3350"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, "<3>Serving Cell Info: Failed to retrieve Cell ID\n",
                                           "<3>Serving Cell Info: Failed to retrieve Freq Band Indicator\n"));
}

TEST_F(LTEServingCellInfoTest, NumbersAreShownAsSigned32BitOnes) {
  const Value record = cell("LTE", "Serving", 4294967295);
  record.dictionary()->set("CellIdentity", Value::ofInteger(4294967301));
  record.dictionary()->set("TrackingAreaCode", Value::ofReal(-1.9));
  record.dictionary()->set("PhysicalCellIdentity", Value::ofInteger(2147483648));
  decodeCells({record});
  EXPECT_EQ(shown(), R"({Tracking Area Code: "-1", Cell Identity: "5", Physical Cell ID: "-2147483648", )"
                     R"(Freq Band Indicator: "7", UARFCN: "-1"})");
}

TEST_F(LTEServingCellInfoTest, APayloadThatIsNoPropertyListIsReportedTwiceAndChangesNothing) {
  section.dictionary()->set("UARFCN", "old");
  decode(serverMessageOfText(0xFF0001, "<plist"), 0xFF0001);
  EXPECT_EQ(shown(), R"({UARFCN: "old"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, failedParse, noArray));
}

TEST_F(LTEServingCellInfoTest, APayloadThatIsADictionaryIsReportedAsAFailedParse) {
  decode(serverMessage(0xFF0001, cell("LTE", "Serving", 3350)), 0xFF0001);
  EXPECT_EQ(shown(), "{}");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, failedParse, noArray));
}

TEST_F(LTEServingCellInfoTest, EveryTruncatedCellMonitorMessageIsAFailedParse) {
  Bytes message = serverMessage(0xFF0001, Value::ofArray({cell("LTE", "Serving", 3350)}));
  while (!message.empty()) {
    message.pop_back();
    decode(message, 0xFF0001);
    EXPECT_EQ(shown(), "{}") << message.size() << " bytes";
    EXPECT_THAT(log.takeTexts(), ElementsAre(trace, failedParse, noArray)) << message.size() << " bytes";
  }
}

TEST_F(LTEServingCellInfoTest, EntriesOfTheThreeCodesMixAndTheLastValueOfEachStays) {
  decode(antennas(2), antennasCode);
  decode(identity(), identityCode);
  decodeCells({cell("LTE", "Serving", 3350)});
  EXPECT_EQ(shown(),
            R"({Num Tx Antennas: "2", Physical Cell ID: "302", Download Frequency: "1300", )"
            R"(Upload Frequency: "19300", Download Bandwidth: "10 MHz", Upload Bandwidth: "20 MHz", )"
            R"(Cell Identity: "26885892", Tracking Area Code: "40002", Freq Band Indicator: "7", )"
            R"(UARFCN: "3350"})");
}

}  // namespace
}  // namespace varnel
