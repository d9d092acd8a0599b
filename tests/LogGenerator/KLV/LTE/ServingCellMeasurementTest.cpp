#include "LogGenerator/KLV/LTE/ServingCellMeasurement.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t measurementCode = 0xB17F;
constexpr const char* trace = "<4>Serving Cell Measurements";

using ServingCellMeasurementTest = RowsDecoderTest<ServingCellMeasurement, measurementCode>;

PacketBuilder zeros() { return PacketBuilder(measurementCode, 33); }

// Fields that all differ; all bits that are not shown are set.
Bytes measurement(std::size_t size = 33) {
  return PacketBuilder(measurementCode, size)
      .fill(0xEE)
      .u8(13, 2)
      .u16(17, 1300)
      .u8(19, 0x2D)
      .u8(20, 0xEB)
      .u8(21, 0xAB)
      .u8(22, 0xAA)
      .u8(23, 0x3A)
      .u8(24, 0x97)
      .u8(25, 0x89)
      .u8(26, 0x8C)
      .u8(27, 0x9A)
      .u8(28, 0xFD)
      .u8(29, 0xBB)
      .u8(30, 0xF2)
      .u8(31, 0x5B)
      .u8(32, 0xE6)
      .bytes();
}

constexpr const char* measurementRows =
    R"({Version: "2", E-ARFCN: "1300", Physical Cell ID: "301", Serving Layer Priority: "5", )"
    R"(Measured RSRP: "-97.25 dBm", Average RSRP: "-54.75 dBm", Measured RSRQ: "-10.50 dB", )"
    R"(Average RSRQ: "-11.25 dB", Measured RSSI: "-71.50 dBm", Qrxlevmin: "-128 dBm", P_Max: "23 dBm", )"
    R"(Max UE Tx Power: "24 dBm", Srxlev: "29 dBm", Num of Consecutive DRX Cycles of S < 0: "37", )"
    R"(S Intra Search: "62 dB", S Non Intra Search: "22 dBm", Measurement Rules Updated: "True", )"
    R"(Measurement Rules: "9"})";

TEST_F(ServingCellMeasurementTest, AMeasurementShowsEighteenEntriesInThisOrder) {
  decode(measurement());
  EXPECT_EQ(shown(), measurementRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ServingCellMeasurementTest, AMeasurementOf34BytesShowsTheSameAsOneOf33) {
  decode(measurement(34));
  EXPECT_EQ(shown(), measurementRows);
}

TEST_F(ServingCellMeasurementTest, ZerosShowTheLowEndOfEachScale) {
  decode(zeros().bytes());
  EXPECT_EQ(
      shown(),
      R"({Version: "0", E-ARFCN: "0", Physical Cell ID: "0", Serving Layer Priority: "0", )"
      R"(Measured RSRP: "-140.00 dBm", Average RSRP: "-140.00 dBm", Measured RSRQ: "-30.00 dB", )"
      R"(Average RSRQ: "-30.00 dB", Measured RSSI: "-140.00 dBm", Qrxlevmin: "-140 dBm", P_Max: "-30 dBm", )"
      R"(Max UE Tx Power: "-30 dBm", Srxlev: "-30 dBm", Num of Consecutive DRX Cycles of S < 0: "0", )"
      R"(S Intra Search: "0 dB", S Non Intra Search: "0 dBm", Measurement Rules Updated: "False", )"
      R"(Measurement Rules: "0"})");
}

TEST_F(ServingCellMeasurementTest, AllOnesShowTheHighEndOfEachScale) {
  decode(zeros().fill(0xFF).bytes());
  EXPECT_EQ(shown(),
            R"({Version: "255", E-ARFCN: "65535", Physical Cell ID: "511", Serving Layer Priority: "15", )"
            R"(Measured RSRP: "-12.25 dBm", Average RSRP: "-12.25 dBm", Measured RSRQ: "1.75 dB", )"
            R"(Average RSRQ: "1.75 dB", Measured RSSI: "115.50 dBm", Qrxlevmin: "-14 dBm", P_Max: "97 dBm", )"
            R"(Max UE Tx Power: "33 dBm", Srxlev: "97 dBm", Num of Consecutive DRX Cycles of S < 0: "63", )"
            R"(S Intra Search: "126 dB", S Non Intra Search: "126 dBm", Measurement Rules Updated: "True", )"
            R"(Measurement Rules: "15"})");
}

TEST_F(ServingCellMeasurementTest, EachBitCountsInItsOwnEntryAlone) {
  const std::vector<std::string_view> rsrp = {"-139.75 dBm", "-139.50 dBm", "-139.00 dBm",
                                              "-138.00 dBm", "-136.00 dBm", "-132.00 dBm",
                                              "-124.00 dBm", "-108.00 dBm", "-76.00 dBm"};
  const std::vector<std::string_view> rsrq = {"-29.75 dB", "-29.50 dB", "-29.00 dB", "-28.00 dB",
                                              "-26.00 dB", "-22.00 dB", "-14.00 dB"};
  expectTextsOfSingleBits(
      zeros().bytes(), 13, 33,
      {{"Version", 13, 0, "0", {"1", "2", "4", "8", "16", "32", "64", "128"}},
       {"E-ARFCN",
        17,
        0,
        "0",
        {"1", "2", "4", "8", "16", "32", "64", "128", "256", "512", "1024", "2048", "4096", "8192", "16384",
         "32768"}},
       {"Physical Cell ID", 19, 0, "0", {"1", "2", "4", "8", "16", "32", "64", "128", "256"}},
       {"Serving Layer Priority", 20, 1, "0", {"1", "2", "4", "8"}},
       {"Measured RSRP", 21, 0, "-140.00 dBm", rsrp},
       {"Average RSRP", 22, 1, "-140.00 dBm", rsrp},
       {"Measured RSRQ", 23, 2, "-30.00 dB", rsrq},
       {"Average RSRQ", 24, 1, "-30.00 dB", rsrq},
       {"Measured RSSI",
        25,
        0,
        "-140.00 dBm",
        {"-139.50 dBm", "-139.00 dBm", "-138.00 dBm", "-136.00 dBm", "-132.00 dBm", "-124.00 dBm",
         "-108.00 dBm", "-76.00 dBm", "-12.00 dBm"}},
       {"Qrxlevmin",
        26,
        1,
        "-140 dBm",
        {"-138 dBm", "-136 dBm", "-132 dBm", "-124 dBm", "-108 dBm", "-76 dBm"}},
       {"P_Max",
        26,
        7,
        "-30 dBm",
        {"-29 dBm", "-28 dBm", "-26 dBm", "-22 dBm", "-14 dBm", "2 dBm", "Not Present"}},
       {"Max UE Tx Power",
        27,
        6,
        "-30 dBm",
        {"-29 dBm", "-28 dBm", "-26 dBm", "-22 dBm", "-14 dBm", "2 dBm"}},
       {"Srxlev",
        29,
        0,
        "-30 dBm",
        {"-29 dBm", "-28 dBm", "-26 dBm", "-22 dBm", "-14 dBm", "2 dBm", "34 dBm"}},
       {"Num of Consecutive DRX Cycles of S < 0", 29, 7, "0", {"1", "2", "4", "8", "16", "32"}},
       {"S Intra Search", 30, 5, "0 dB", {"2 dB", "4 dB", "8 dB", "16 dB", "32 dB", "Not Present"}},
       {"S Non Intra Search", 31, 3, "0 dBm", {"2 dBm", "4 dBm", "8 dBm", "16 dBm", "32 dBm", "Not Present"}},
       {"Measurement Rules Updated", 32, 1, "False", {"True"}},
       {"Measurement Rules", 32, 2, "0", {"1", "2", "4", "8"}}});
}

TEST_F(ServingCellMeasurementTest, AMaximumPowerOf64IsNotPresentAndItsNeighborsAreShown) {
  decode(zeros().u8(26, 0x80).u8(27, 0x1F).bytes());
  EXPECT_EQ(shown("P_Max"), R"("33 dBm")");
  decode(zeros().u8(27, 0x20).bytes());
  EXPECT_EQ(shown("P_Max"), R"("Not Present")");
  decode(zeros().u8(26, 0x80).u8(27, 0x20).bytes());
  EXPECT_EQ(shown("P_Max"), R"("35 dBm")");
}

TEST_F(ServingCellMeasurementTest, TheTransmitPowerOfTheDeviceIsAlwaysPresent) {
  for (unsigned raw = 0; raw < 64; ++raw) {
    decode(zeros()
               .u8(27, static_cast<std::uint8_t>(raw << 6))
               .u8(28, static_cast<std::uint8_t>(raw >> 2))
               .bytes());
    EXPECT_NE(shown("Max UE Tx Power"), R"("Not Present")") << raw;
  }
  EXPECT_EQ(shown("Max UE Tx Power"), R"("33 dBm")");
}

TEST_F(ServingCellMeasurementTest, AnIntraFrequencySearchThresholdOf32IsNotPresentAndItsNeighborsAreShown) {
  decode(zeros().u8(30, 0xE0).u8(31, 0x03).bytes());
  EXPECT_EQ(shown("S Intra Search"), R"("62 dB")");
  decode(zeros().u8(31, 0x04).bytes());
  EXPECT_EQ(shown("S Intra Search"), R"("Not Present")");
  decode(zeros().u8(30, 0x20).u8(31, 0x04).bytes());
  EXPECT_EQ(shown("S Intra Search"), R"("66 dB")");
}

TEST_F(ServingCellMeasurementTest, AnOtherFrequenciesSearchThresholdOf32IsNotPresentAndItsNeighborsAreShown) {
  decode(zeros().u8(31, 0xF8).bytes());
  EXPECT_EQ(shown("S Non Intra Search"), R"("62 dBm")");
  decode(zeros().u8(32, 0x01).bytes());
  EXPECT_EQ(shown("S Non Intra Search"), R"("Not Present")");
  decode(zeros().u8(31, 0x08).u8(32, 0x01).bytes());
  EXPECT_EQ(shown("S Non Intra Search"), R"("66 dBm")");
}

TEST_F(ServingCellMeasurementTest, ARawRsrqOf120Shows0Decibels) {
  decode(zeros().u8(24, 0xF0).bytes());
  EXPECT_EQ(shown("Average RSRQ"), R"("0.00 dB")");
}

TEST_F(ServingCellMeasurementTest, EachMeasurementOverwritesTheEntriesAndKeepsTheirPlaces) {
  section.dictionary()->set("Measurement Rules", "");
  decode(zeros().bytes());
  decode(measurement());
  ASSERT_EQ(section.dictionary()->size(), 18u);
  EXPECT_EQ(section.dictionary()->begin()->key, "Measurement Rules");
  EXPECT_EQ(shown("Measurement Rules"), R"("9")");
  EXPECT_EQ(shown("P_Max"), R"("23 dBm")");
}

}  // namespace
}  // namespace varnel
