#include "LogGenerator/KLV/LTE/RandomAccess.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using RandomAccessTest = RowsDecoderTest<RandomAccess, 0xB168>;

Bytes access(std::uint8_t result, std::uint16_t timingAdvance) {
  return PacketBuilder(0xB168, 18).u8(13, 1).u8(14, 63).u8(15, result).u16(16, timingAdvance).bytes();
}

TEST_F(RandomAccessTest, ATimingAdvanceOf16IsADistanceOf1250Meters) {
  decode(access(0, 16));
  EXPECT_EQ(shown(),
            R"({Version: "1", Preamble: "63", Result: "Success", Timing Advance: "16", Distance: "1250 m"})");
}

TEST_F(RandomAccessTest, OnlyElevenBitsAreTheTimingAdvance) {
  decode(access(0, 0xF801));
  EXPECT_EQ(shown("Timing Advance"), R"("1")");
}

TEST_F(RandomAccessTest, EachResultHasItsText) {
  expectTableOfByte(access(0, 0), 15, "Result", {"Success", "No Answer", "Aborted"}, "Unknown");
}

TEST_F(RandomAccessTest, PacketsBelow18BytesAreIgnored) {
  expectIgnoredBelow(18, access(0, 16), 0xB168, {"<4>Random Access"});
}

}  // namespace
}  // namespace varnel
