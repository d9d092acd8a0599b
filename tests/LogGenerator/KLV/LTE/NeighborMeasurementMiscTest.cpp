#include "LogGenerator/KLV/LTE/NeighborMeasurementMisc.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t measurementCode = 0xB180;
constexpr const char* trace = "<4>Neighbor Measurements";

using NeighborMeasurementMiscTest = RowsDecoderTest<NeighborMeasurementMisc, measurementCode>;

// Fields that all differ; all bits that are not shown are set.
Bytes measurement(std::size_t size = 21) {
  return PacketBuilder(measurementCode, size).fill(0xEE).u8(13, 3).u16(17, 3350).u8(19, 0xC6).bytes();
}

constexpr const char* measurementRows = R"({Version: "3", E-ARFCN: "3350", Qrxlevmin: "-128 dBm"})";

TEST_F(NeighborMeasurementMiscTest, AMeasurementShowsThreeEntriesInThisOrder) {
  decode(measurement());
  EXPECT_EQ(shown(), measurementRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(NeighborMeasurementMiscTest, AMeasurementOf22BytesShowsTheSameAsOneOf21) {
  decode(measurement(22));
  EXPECT_EQ(shown(), measurementRows);
}

TEST_F(NeighborMeasurementMiscTest, AllOnesShowTheHighEndOfEachScale) {
  decode(PacketBuilder(measurementCode, 21).fill(0xFF).bytes());
  EXPECT_EQ(shown(), R"({Version: "255", E-ARFCN: "65535", Qrxlevmin: "-14 dBm"})");
}

TEST_F(NeighborMeasurementMiscTest, EachBitCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(PacketBuilder(measurementCode, 21).bytes(), 13, 21,
                          {{"Version", 13, 0, "0", {"1", "2", "4", "8", "16", "32", "64", "128"}},
                           {"E-ARFCN",
                            17,
                            0,
                            "0",
                            {"1", "2", "4", "8", "16", "32", "64", "128", "256", "512", "1024", "2048",
                             "4096", "8192", "16384", "32768"}},
                           {"Qrxlevmin",
                            19,
                            0,
                            "-140 dBm",
                            {"-138 dBm", "-136 dBm", "-132 dBm", "-124 dBm", "-108 dBm", "-76 dBm"}}});
}

}  // namespace
}  // namespace varnel
