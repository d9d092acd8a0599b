#include "LogGenerator/Radios/NR/ServingCell.h"

#include "LogGenerator/NumberFormats.h"
#include "tests/LogGenerator/Radios/PayloadBuilder.h"
#include "tests/support/DecoderHarness.h"

namespace varnel::nr {
namespace {

using NRServingCellTest = RowsDecoderTest<ServingCell, 0xB823>;

// From the channel number on all versions are alike.
PayloadBuilder cell(std::uint32_t version, std::size_t size, std::size_t cellOffset, std::size_t rest) {
  return PayloadBuilder(0xB823, size)
      .fill(0xA5)
      .u32(0, version)
      .u16(cellOffset, 411)
      .u32(rest, 501390)
      .u32(rest + 4, 501390)
      .u16(rest + 8, 80)
      .u16(rest + 10, 60)
      .u32(rest + 12, 0x8765'4321)
      .u32(rest + 16, 0x0000'0009)
      .u16(rest + 20, 901)
      .u8(rest + 22, 3)
      .u16(rest + 23, 7)
      .u8(rest + 25, 1)
      .u32(rest + 26, 1193046)
      .u16(rest + 30, 41);
}
PayloadBuilder version4() { return cell(4, 38, 4, 6); }

// 0x987654321 is 40926266145.
constexpr std::string_view allButTheVersion =
    R"(Physical Cell ID: "411", NR-ARFCN: "501390", Uplink NR-ARFCN: "501390", Band: "n41", )"
    R"(Downlink Bandwidth: "80 MHz", Uplink Bandwidth: "60 MHz", Tracking Area Code: "1193046", )"
    R"(Allowed Access: "1", Downlink Frequency: "2506.950 MHz", Uplink Frequency: "2506.950 MHz", )"
    R"(PLMN: "901-007", Cell Identity: "40926266145"})";

TEST_F(NRServingCellTest, Version4HasTheChannelBehindTheCell) {
  decode(version4().bytes());
  EXPECT_EQ(shown(), R"({Version: "4", )" + std::string(allButTheVersion));
}

TEST_F(NRServingCellTest, Version3_0HasTheGlobalIdentityInBetween) {
  decode(cell(0x30000, 46, 4, 14).bytes());
  EXPECT_EQ(shown(), R"({Version: "3.0", )" + std::string(allButTheVersion));
}

TEST_F(NRServingCellTest, Versions3_2And3_3HaveThreeBytesMoreInFront) {
  decode(cell(0x30002, 49, 7, 17).bytes());
  EXPECT_EQ(shown(), R"({Version: "3.2", )" + std::string(allButTheVersion));
  section.dictionary()->truncate(0);
  decode(cell(0x30003, 49, 7, 17).bytes());
  EXPECT_EQ(shown(), R"({Version: "3.3", )" + std::string(allButTheVersion));
}

TEST_F(NRServingCellTest, Version3_1IsNotKnown) {
  decode(cell(0x30001, 49, 7, 17).bytes());
  EXPECT_EQ(shown(), R"-({Version: "3.1 (not known)"})-");
}

TEST_F(NRServingCellTest, TheCellIdentityHas64Bits) {
  decode(version4().u32(18, 0xFFFF'FFFF).u32(22, 0xFFFF'FFFF).bytes());
  EXPECT_EQ(shown("Cell Identity"), R"("18446744073709551615")");
  decode(version4().u32(18, 0).u32(22, 0).bytes());
  EXPECT_EQ(shown("Cell Identity"), R"("0")");
}

TEST_F(NRServingCellTest, ANetworkCodeHasAsManyDigitsAsThePacketSays) {
  decode(version4().u8(28, 2).bytes());
  EXPECT_EQ(shown("PLMN"), R"("901-07")");
}

TEST_F(NRServingCellTest, ACodeWithTooManyDigitsIsNoNetwork) {
  decode(version4().u16(26, 1000).bytes());
  EXPECT_EQ(shown("PLMN"), R"("")");
}

TEST_F(NRServingCellTest, AnUplinkChannelBeyondTheStandardHasNoFrequency) {
  decode(version4().u32(10, 0xFFFF'FFFF).bytes());
  EXPECT_EQ(shown("Uplink NR-ARFCN"), R"("4294967295")");
  EXPECT_EQ(shown("Uplink Frequency"), R"("")");
}

TEST_F(NRServingCellTest, ACellOrChannelBeyondTheStandardShowsNothing) {
  decode(version4().u16(4, 1008).bytes());
  decode(version4().u32(6, 3279166).bytes());
  EXPECT_EQ(shown(), R"({Version: "4"})");
}

TEST_F(NRServingCellTest, ShorterPacketsAreIgnored) {
  expectIgnoredBelow(13 + 38, version4().bytes(), 0xB823, {});
  expectIgnoredBelow(13 + 46, cell(0x30000, 46, 4, 14).bytes(), 0xB823, {});
  expectIgnoredBelow(13 + 49, cell(0x30002, 49, 7, 17).bytes(), 0xB823, {});
  expectIgnoredBelow(13 + 49, cell(0x30003, 49, 7, 17).bytes(), 0xB823, {});
}

TEST_F(NRServingCellTest, NumbersHaveUnits) {
  NumberFormats formats;
  SectionFormats ofSection(formats, "Serving Cell");
  decoder.listNumberFormats(ofSection);
  EXPECT_EQ(formats.under("Serving Cell/Uplink Frequency").unit(), "MHz");
  EXPECT_EQ(formats.under("Serving Cell/Downlink Bandwidth").unit(), "MHz");
  EXPECT_EQ(formats.under("Serving Cell/Band").number("n41"), "41");
}

}  // namespace
}  // namespace varnel::nr
