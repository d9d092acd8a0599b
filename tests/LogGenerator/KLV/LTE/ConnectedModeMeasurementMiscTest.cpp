#include "LogGenerator/KLV/LTE/ConnectedModeMeasurementMisc.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t reportCode = 0xB179;
constexpr const char* trace = "<4>Connected mode LTE Intra-frequency Measurement";

using ConnectedModeMeasurementMiscTest = RowsDecoderTest<ConnectedModeMeasurementMisc, reportCode>;

// Fields that all differ, among other bytes that must not be shown.
Bytes report(std::size_t size = 29) {
  return PacketBuilder(reportCode, size)
      .fill(0xEE)
      .u16(17, 1300)
      .u16(19, 301)
      .u16(21, 9871)
      .u16(23, 171)
      .u16(25, 66)
      .bytes();
}

constexpr const char* reportRows =
    R"({E-ARFCN: "1300", Serving Physical Cell ID: "301", Subframe Number: "9871", )"
    R"(Serving Filtered RSRP: "-97.25 dBm", Serving Filtered RSRQ: "-11.75 dB"})";

TEST_F(ConnectedModeMeasurementMiscTest, AReportShowsFiveEntriesInThisOrder) {
  decode(report());
  EXPECT_EQ(shown(), reportRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ConnectedModeMeasurementMiscTest, AReportOf30BytesShowsTheSameAsOneOf29) {
  decode(report(30));
  EXPECT_EQ(shown(), reportRows);
}

TEST_F(ConnectedModeMeasurementMiscTest, ZerosShowTheLowEndOfEachScale) {
  decode(PacketBuilder(reportCode, 29).bytes());
  EXPECT_EQ(shown(), R"({E-ARFCN: "0", Serving Physical Cell ID: "0", Subframe Number: "0", )"
                     R"(Serving Filtered RSRP: "-140.00 dBm", Serving Filtered RSRQ: "-20.00 dB"})");
}

TEST_F(ConnectedModeMeasurementMiscTest, AllOnesShowTheHighEndOfEachScale) {
  decode(PacketBuilder(reportCode, 29).fill(0xFF).bytes());
  EXPECT_EQ(shown(), R"({E-ARFCN: "65535", Serving Physical Cell ID: "65535", Subframe Number: "65535", )"
                     R"(Serving Filtered RSRP: "16243.75 dBm", Serving Filtered RSRQ: "8171.88 dB"})");
}

TEST_F(ConnectedModeMeasurementMiscTest, EachBitCountsInItsOwnEntryAlone) {
  const std::vector<std::string_view> powersOfTwo = {"1",    "2",    "4",     "8",    "16",   "32",
                                                     "64",   "128",  "256",   "512",  "1024", "2048",
                                                     "4096", "8192", "16384", "32768"};
  expectTextsOfSingleBits(
      PacketBuilder(reportCode, 29).bytes(), 13, 29,
      {{"E-ARFCN", 17, 0, "0", powersOfTwo},
       {"Serving Physical Cell ID", 19, 0, "0", powersOfTwo},
       {"Subframe Number", 21, 0, "0", powersOfTwo},
       {"Serving Filtered RSRP",
        23,
        0,
        "-140.00 dBm",
        {"-139.75 dBm", "-139.50 dBm", "-139.00 dBm", "-138.00 dBm", "-136.00 dBm", "-132.00 dBm",
         "-124.00 dBm", "-108.00 dBm", "-76.00 dBm", "-12.00 dBm", "116.00 dBm", "372.00 dBm", "884.00 dBm",
         "1908.00 dBm", "3956.00 dBm", "8052.00 dBm"}},
       {"Serving Filtered RSRQ",
        25,
        0,
        "-20.00 dB",
        {"-19.88 dB", "-19.75 dB", "-19.50 dB", "-19.00 dB", "-18.00 dB", "-16.00 dB", "-12.00 dB",
         "-4.00 dB", "12.00 dB", "44.00 dB", "108.00 dB", "236.00 dB", "492.00 dB", "1004.00 dB",
         "2028.00 dB", "4076.00 dB"}}});
}

TEST_F(ConnectedModeMeasurementMiscTest, EighthsOfADecibelAreRoundedToTheEvenHundredth) {
  const auto rsrq = [&](std::uint16_t raw) {
    decode(PacketBuilder(reportCode, 29).u16(25, raw).bytes());
    return shown("Serving Filtered RSRQ");
  };
  EXPECT_EQ(rsrq(3), R"("-19.62 dB")");
  EXPECT_EQ(rsrq(5), R"("-19.38 dB")");
  EXPECT_EQ(rsrq(7), R"("-19.12 dB")");
  EXPECT_EQ(rsrq(159), R"("-0.12 dB")");
  EXPECT_EQ(rsrq(160), R"("0.00 dB")");
  EXPECT_EQ(rsrq(161), R"("0.12 dB")");
}

TEST_F(ConnectedModeMeasurementMiscTest, ZeroDecibelMilliwattsShowWithoutASign) {
  decode(PacketBuilder(reportCode, 29).u16(23, 560).bytes());
  EXPECT_EQ(shown("Serving Filtered RSRP"), R"("0.00 dBm")");
}

TEST_F(ConnectedModeMeasurementMiscTest, TheNumbersOfRecordsChangeNothing) {
  Bytes packet = report();
  packet[27] = 255;
  packet[28] = 255;
  decode(packet);
  EXPECT_EQ(shown(), reportRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

}  // namespace
}  // namespace varnel
