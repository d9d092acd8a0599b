#include "LogGenerator/Radios/NR/MasterInformation.h"

#include "tests/LogGenerator/Radios/PayloadBuilder.h"
#include "tests/support/DecoderHarness.h"

namespace varnel::nr {
namespace {

using MasterInformationTest = RowsDecoderTest<MasterInformation, 0xB822>;

PayloadBuilder block(std::uint32_t version, std::size_t size) {
  return PayloadBuilder(0xB822, size).u32(0, version).u16(4, 731).u32(6, 387410);
}

TEST_F(MasterInformationTest, Version3HasTheSpacingInTheTwoHighestBits) {
  decode(block(3, 14).u32(10, 0x4000'03E7).bytes());  // 01, and frame 999
  EXPECT_EQ(shown(),
            R"({Version: "3", Physical Cell ID: "731", NR-ARFCN: "387410", )"
            R"(System Frame Number: "999", Subcarrier Spacing: "30 kHz", Frequency: "1937.050 MHz"})");
}

TEST_F(MasterInformationTest, Version2_0HasTheSpacingOneBitHigherInFiveBytes) {
  decode(block(0x20000, 15).u32(10, 0x8000'0001).u8(14, 1).bytes());
  EXPECT_EQ(shown(),
            R"({Version: "2.0", Physical Cell ID: "731", NR-ARFCN: "387410", )"
            R"(System Frame Number: "1", Subcarrier Spacing: "120 kHz", Frequency: "1937.050 MHz"})");
}

TEST_F(MasterInformationTest, EachSpacingHasItsText) {
  const char* const texts[] = {R"("15 kHz")", R"("30 kHz")", R"("60 kHz")", R"("120 kHz")"};
  for (std::uint32_t spacing = 0; spacing < 4; ++spacing) {
    decode(block(3, 14).u32(10, spacing << 30).bytes());
    EXPECT_EQ(shown("Subcarrier Spacing"), texts[spacing]);
    decode(block(0x20000, 15).u32(10, spacing << 31).u8(14, static_cast<std::uint8_t>(spacing >> 1)).bytes());
    EXPECT_EQ(shown("Subcarrier Spacing"), texts[spacing]);
  }
}

TEST_F(MasterInformationTest, OnlyTenBitsAreTheFrameNumber) {
  decode(block(3, 14).u32(10, 0x3FFF'FC00).bytes());
  EXPECT_EQ(shown("System Frame Number"), R"("0")");
  EXPECT_EQ(shown("Subcarrier Spacing"), R"("15 kHz")");
}

TEST_F(MasterInformationTest, TheLastCellAndChannelOfTheStandardAreShown) {
  decode(block(3, 14).u16(4, 1007).u32(6, 3279165).bytes());
  EXPECT_EQ(shown("Physical Cell ID"), R"("1007")");
  EXPECT_EQ(shown("Frequency"), R"("99999.960 MHz")");
}

TEST_F(MasterInformationTest, ACellOrChannelBeyondTheStandardShowsNothing) {
  decode(block(3, 14).u16(4, 1008).bytes());
  decode(block(3, 14).u32(6, 3279166).bytes());
  EXPECT_EQ(shown(), R"({Version: "3"})");
}

TEST_F(MasterInformationTest, AnotherVersionIsNotKnown) {
  decode(block(0x20001, 15).bytes());
  EXPECT_EQ(shown(), R"-({Version: "2.1 (not known)"})-");
}

TEST_F(MasterInformationTest, ShorterPacketsAreIgnored) {
  expectIgnoredBelow(13 + 14, block(3, 14).bytes(), 0xB822, {});
  expectIgnoredBelow(13 + 15, block(0x20000, 15).bytes(), 0xB822, {});
}

}  // namespace
}  // namespace varnel::nr
