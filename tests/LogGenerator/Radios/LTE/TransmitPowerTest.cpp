#include "LogGenerator/Radios/LTE/TransmitPower.h"

#include "LogGenerator/NumberFormats.h"
#include "tests/LogGenerator/Radios/PayloadBuilder.h"
#include "tests/support/DecoderHarness.h"

namespace varnel::lte {
namespace {

using LTETransmitPowerTest = RowsDecoderTest<TransmitPower, 0xB139>;

// A packet of 0xB139 with so many records in it, and another number of them in its header.
PayloadBuilder transmissions(std::uint8_t version, std::size_t stride, unsigned records, unsigned count) {
  return PayloadBuilder(0xB139, 8 + stride * records)
      .fill(0xFF)
      .u8(0, version)
      .u16(1, static_cast<std::uint16_t>(0xC1FF | count << 9));
}

// The bits of a 32-bit word from one on; all others are set.
std::uint32_t word(unsigned firstBit, unsigned width, unsigned value) {
  const std::uint32_t mask = ((1u << width) - 1) << firstBit;
  return ~mask | (value << firstBit & mask);
}

// A packet of records of 12 bytes, the last of which is given.
PayloadBuilder powers(std::uint32_t logCode, std::uint8_t version, std::uint32_t first, std::uint32_t second,
                      std::uint32_t third) {
  return PayloadBuilder(logCode, 4 + 24)
      .u8(0, version)
      .u8(3, 2)
      .u32(16, first)
      .u32(20, second)
      .u32(24, third);
}

TEST_F(LTETransmitPowerTest, TheLastTransmissionOfVersion43IsShown) {
  decode(transmissions(43, 64, 2, 2).u32(8 + 64 + 24, word(0, 7, 23)).u16(8 + 64 + 12, 4392).bytes());
  EXPECT_EQ(shown(), R"({Version: "43", PUSCH Power: "23 dBm", Transport Block Size: "4392"})");
}

TEST_F(LTETransmitPowerTest, TheLastTransmissionOfVersion102IsShown) {
  decode(transmissions(102, 68, 3, 3).u32(8 + 136 + 24, word(0, 7, 12)).u16(8 + 136 + 8, 57).bytes());
  EXPECT_EQ(shown(), R"({Version: "102", PUSCH Power: "12 dBm", Transport Block Size: "57"})");
}

TEST_F(LTETransmitPowerTest, ThePowerOfATransmissionHasSevenBitsWithASign) {
  const auto powerOf = [&](unsigned raw) {
    decode(transmissions(43, 64, 1, 1).u32(8 + 24, word(0, 7, raw)).bytes());
    return shown("PUSCH Power");
  };
  EXPECT_EQ(powerOf(63), R"("63 dBm")");
  EXPECT_EQ(powerOf(64), R"("-64 dBm")");
  EXPECT_EQ(powerOf(127), R"("-1 dBm")");
}

TEST_F(LTETransmitPowerTest, OfACountThatLiesTheLastWholeRecordIsShown) {
  decode(transmissions(43, 64, 2, 31).u32(8 + 64 + 24, 20).bytes());
  EXPECT_EQ(shown("PUSCH Power"), R"("20 dBm")");
  decode(transmissions(43, 64, 2, 1).u32(8 + 24, 10).bytes());
  EXPECT_EQ(shown("PUSCH Power"), R"("10 dBm")");
  Bytes packet = transmissions(43, 64, 2, 2).u32(8 + 24, 15).bytes();
  packet.pop_back();
  decode(packet);
  EXPECT_EQ(shown("PUSCH Power"), R"("15 dBm")");
}

TEST_F(LTETransmitPowerTest, WithoutRecordsOnlyTheVersionIsShown) {
  decode(transmissions(102, 68, 1, 0).bytes());
  decode(transmissions(102, 67, 1, 1).bytes());
  EXPECT_EQ(shown(), R"({Version: "102"})");
}

TEST_F(LTETransmitPowerTest, TheSharedChannelOfVersion4HasNoResourceBlocks) {
  decode(powers(0xB16E, 4, word(14, 8, 0xF6), word(0, 14, 9144) & word(14, 8, 133), word(5, 8, 0xEC)).bytes(),
         0xB16E);
  EXPECT_EQ(shown(), R"({Version: "4", PUSCH Power: "-10 dBm", PUSCH Actual Power: "-20 dBm", )"
                     R"(PUSCH Path Loss: "133 dB", Transport Block Size: "9144"})");
}

TEST_F(LTETransmitPowerTest, TheSharedChannelOfVersion5HasResourceBlocks) {
  decode(powers(0xB16E, 5, word(14, 8, 21), word(0, 8, 100) & word(8, 14, 9144) & word(22, 8, 133),
                word(15, 8, 20))
             .bytes(),
         0xB16E);
  EXPECT_EQ(shown(),
            R"({Version: "5", PUSCH Power: "21 dBm", PUSCH Actual Power: "20 dBm", )"
            R"(PUSCH Path Loss: "133 dB", PUSCH Resource Blocks: "100", Transport Block Size: "9144"})");
}

TEST_F(LTETransmitPowerTest, TheSharedChannelOfVersion25HasTheMaximumPower) {
  decode(powers(0xB16E, 25, word(17, 8, 21), word(0, 8, 6) & word(8, 14, 16383) & word(22, 8, 255),
                word(15, 8, 20) & word(23, 8, 23))
             .bytes(),
         0xB16E);
  EXPECT_EQ(shown(),
            R"({Version: "25", PUSCH Power: "21 dBm", PUSCH Actual Power: "20 dBm", )"
            R"(PUSCH Path Loss: "255 dB", PUSCH Resource Blocks: "6", Transport Block Size: "16383", )"
            R"(Maximum Power: "23 dBm"})");
}

TEST_F(LTETransmitPowerTest, TheControlChannelHasRowsOfItsOwn) {
  for (const std::uint8_t version : {4, 24}) {
    section.dictionary()->truncate(0);
    decode(powers(0xB16F, version, word(14, 8, 0x9C), word(11, 8, 120), word(16, 8, 3)).bytes(), 0xB16F);
    EXPECT_EQ(shown(), R"({Version: ")" + std::to_string(version) +
                           R"(", PUCCH Power: "-100 dBm", PUCCH Actual Power: "3 dBm", )"
                           R"(PUCCH Path Loss: "120 dB"})");
  }
}

TEST_F(LTETransmitPowerTest, EveryTruncationShowsTheLastWholeRecord) {
  const Bytes whole = powers(0xB16E, 5, word(14, 8, 21), 0, 0).u32(4, word(14, 8, 11)).bytes();
  forEachTruncation(
      whole,
      [&](std::size_t size, const auto&) {
        if (size < 13 + 4) {
          EXPECT_EQ(shown(), oldContent());
        } else {
          EXPECT_EQ(shown("PUSCH Power"), size < 13 + 16 ? "absent" : R"("11 dBm")");
        }
      },
      0xB16E);
}

TEST_F(LTETransmitPowerTest, OtherVersionsAreNotKnown) {
  decode(transmissions(101, 68, 1, 1).bytes());
  EXPECT_EQ(shown(), R"-({Version: "101 (not known)"})-");
  decode(powers(0xB16F, 5, 0, 0, 0).bytes(), 0xB16F);
  EXPECT_EQ(shown(), R"-({Version: "5 (not known)"})-");
}

TEST_F(LTETransmitPowerTest, NumbersHaveUnits) {
  NumberFormats formats;
  SectionFormats ofSection(formats, "Transmit Power");
  decoder.listNumberFormats(ofSection);
  EXPECT_EQ(formats.under("Transmit Power/PUSCH Power").unit(), "dBm");
  EXPECT_EQ(formats.under("Transmit Power/PUSCH Path Loss").unit(), "dB");
  EXPECT_EQ(formats.under("Transmit Power/PUCCH Actual Power").unit(), "dBm");
  EXPECT_EQ(formats.under("Transmit Power/Maximum Power").unit(), "dBm");
}

}  // namespace
}  // namespace varnel::lte
