#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/C2KHarness.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// 241 bytes. Counter 0 counts 128 bits each, so 8 of them are 1024 bits.
PacketBuilder forward(std::uint32_t sequence, std::uint32_t firstCounter) {
  return PacketBuilder(0x1192, 241).u32(13, sequence).u32(17, firstCounter);
}

class FLDataRateTest : public C2KTest {
 protected:
  void SetUp() override {
    // A packet of the other direction leaves no trace here.
    published(PacketBuilder(0x127E, 1750).u32(14, 99).u32(18, 7).bytes());
    for (const char* key : {"RLDataSeqNum", "RLDataSent"}) state.remove(key);
    *extraInfo.dictionary() = {};
  }
  // The rate that the second of two packets shows.
  std::string rate(const PacketBuilder& first, const PacketBuilder& second) {
    state.remove("FLDataSeqNum");
    state.remove("FLDataSent");
    published(first.bytes());
    return published(second.bytes(), "kFLDataRate");
  }
  std::int64_t totalOf(const PacketBuilder& packet) {
    published(packet.bytes());
    return state.get("FLDataSent").integer().value();
  }
};

TEST_F(FLDataRateTest, TheFirstPacketShowsAnEmptyTextAndIsRemembered) {
  EXPECT_EQ(published(forward(7, 8).bytes()), R"({kFLDataRate: ""})");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  EXPECT_EQ(state.get("FLDataSeqNum").integer(), 7);
  EXPECT_EQ(state.get("FLDataSent").integer(), 1024);
  EXPECT_EQ(described(extraInfo), "{FLDataSeqNum1: 7, FLDataSent1: 1024}");
  EXPECT_FALSE(state.has("RLDataSeqNum"));
  EXPECT_FALSE(state.has("RLDataSent"));
}

TEST_F(FLDataRateTest, TheSecondPacketShowsTheRateAndBothAreInTheExtraInfo) {
  published(forward(7, 8).bytes());
  EXPECT_EQ(published(forward(9, 40).bytes()), R"({kFLDataRate: "2.00 kbps"})");
  EXPECT_EQ(state.get("FLDataSeqNum").integer(), 9);
  EXPECT_EQ(state.get("FLDataSent").integer(), 5120);
  EXPECT_EQ(described(extraInfo),
            "{FLDataSeqNum1: 9, FLDataSent1: 5120, FLDataSeqNum2: 7, FLDataSent2: 1024}");
}

TEST_F(FLDataRateTest, TheRateIsTheDifferenceOverTheSequencesIn1024ths) {
  EXPECT_EQ(rate(forward(0, 0), forward(1, 0)), R"("0.00 kbps")");
  EXPECT_EQ(rate(forward(0, 0), forward(1, 8)), R"("1.00 kbps")");
  EXPECT_EQ(rate(forward(0, 8), forward(2, 16)), R"("0.50 kbps")");
  EXPECT_EQ(rate(forward(5, 0), forward(8, 8)), R"("0.33 kbps")");
  EXPECT_EQ(rate(forward(5, 0), forward(8, 16)), R"("0.67 kbps")");
  EXPECT_EQ(rate(forward(0, 0), forward(1, 0xFFFFFFFF)), R"("536870911.88 kbps")");
}

TEST_F(FLDataRateTest, AFallingTotalIsANegativeRate) {
  EXPECT_EQ(rate(forward(1, 16), forward(2, 8)), R"("-1.00 kbps")");
  EXPECT_EQ(rate(forward(1, 0xFFFFFFFF), forward(2, 0)), R"("-536870911.88 kbps")");
}

TEST_F(FLDataRateTest, TwoPacketsWithTheSameSequenceShowNoRateButTheSecondIsRemembered) {
  published(forward(7, 8).bytes());
  EXPECT_EQ(published(forward(7, 16).bytes()), "{}");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  EXPECT_EQ(state.get("FLDataSent").integer(), 2048);
  EXPECT_EQ(described(extraInfo),
            "{FLDataSeqNum1: 7, FLDataSent1: 2048, FLDataSeqNum2: 7, FLDataSent2: 1024}");
  EXPECT_EQ(published(forward(8, 24).bytes()), R"({kFLDataRate: "1.00 kbps"})");
}

TEST_F(FLDataRateTest, ASequenceThatGoesBackShowsNoRate) {
  EXPECT_EQ(rate(forward(7, 0), forward(6, 8)), "absent");
  EXPECT_EQ(state.get("FLDataSeqNum").integer(), 6);
  EXPECT_EQ(rate(forward(0, 0), forward(0xFFFFFFFF, 8)), "absent");
}

TEST_F(FLDataRateTest, ASequenceThatWrapsStillGivesAPositiveDelta) {
  EXPECT_EQ(rate(forward(0xFFFFFFFF, 0), forward(0, 8)), R"("1.00 kbps")");
  EXPECT_EQ(rate(forward(0xFFFFFFFF, 0), forward(1, 8)), R"("0.50 kbps")");
  EXPECT_EQ(rate(forward(0xFFFFFFF0, 0), forward(0x10, 0x100)), R"("1.00 kbps")");
  EXPECT_EQ(rate(forward(0x7FFFFFFF, 0), forward(0x80000000, 8)), R"("1.00 kbps")");
}

TEST_F(FLDataRateTest, ADeltaOf31BitsIsPositiveAndOneMoreIsNot) {
  // 2^32 - 2 packets of 128 bits over 2^31 - 1 sequences.
  EXPECT_EQ(rate(forward(0, 0), forward(0x7FFFFFFF, 0xFFFFFFFE)), R"("0.25 kbps")");
  EXPECT_EQ(rate(forward(0, 0), forward(0x80000000, 8)), "absent");
  EXPECT_EQ(rate(forward(0x80000000, 0), forward(0xFFFFFFFF, 0xFFFFFFFE)), R"("0.25 kbps")");
}

TEST_F(FLDataRateTest, OneOfTheTwoRememberedNumbersDoesNotSuffice) {
  state.set("FLDataSeqNum", Value::ofInteger(6));
  EXPECT_EQ(published(forward(7, 8).bytes()), R"({kFLDataRate: ""})");
  EXPECT_EQ(described(extraInfo), "{FLDataSeqNum1: 7, FLDataSent1: 1024}");
  state.remove("FLDataSeqNum");
  EXPECT_EQ(published(forward(8, 8).bytes()), R"({kFLDataRate: ""})");
  EXPECT_EQ(described(extraInfo), "{FLDataSeqNum1: 8, FLDataSent1: 1024}");
}

TEST_F(FLDataRateTest, ANewExtraInfoIsFilledAgain) {
  published(forward(7, 8).bytes());
  const Value fresh = Value::ofDictionary();
  state.set("ExtraInfo", fresh);
  published(forward(8, 16).bytes());
  EXPECT_EQ(described(fresh), "{FLDataSeqNum2: 7, FLDataSent2: 1024, FLDataSeqNum1: 8, FLDataSent1: 2048}");
}

TEST_F(FLDataRateTest, EachOfThe56CountersHasItsWeight) {
  constexpr std::int64_t weights[56] = {128,  256,  512,  1024, 0,    128, 256,  512,  1024, 0,    128, 256,
                                        512,  1024, 0,    128,  256,  512, 1024, 0,    128,  256,  512, 1024,
                                        0,    512,  1024, 2048, 0,    128, 256,  512,  1024, 0,    512, 1024,
                                        2048, 0,    1024, 3072, 0,    512, 1024, 2048, 0,    4096, 0,   1024,
                                        3072, 0,    4096, 0,    5120, 0,   5120, 0};
  for (std::size_t i = 0; i < 56; ++i) {
    EXPECT_EQ(totalOf(PacketBuilder(0x1192, 241).u32(17 + 4 * i, 3)), 3 * weights[i]) << "counter " << i;
  }
}

TEST_F(FLDataRateTest, TheTotalIsTheSumOfAllCountersIn64Bits) {
  // The weights add up to 48896.
  EXPECT_EQ(totalOf(PacketBuilder(0x1192, 241).fill(0xFF)), 4294967295 * 48896);
  EXPECT_EQ(totalOf(PacketBuilder(0x1192, 300).fill(0xFF)), 4294967295 * 48896);
}

TEST_F(FLDataRateTest, A240BytePacketIsRefusedAndA241ByteOneIsNot) {
  expectRefused(PacketBuilder(0x1192, 240).bytes(),
                "<3>Log code 0x1192 is 240 bytes long but must be at least 241 bytes.");
  EXPECT_EQ(published(PacketBuilder(0x1192, 241).bytes()), R"({kFLDataRate: ""})");
}

TEST_F(FLDataRateTest, EveryTruncatedPacketIsRefusedAndLeavesNoTrace) {
  forEachTruncation(forward(7, 8).bytes(),
                    [&](std::size_t size, const std::string& shown, const auto& lines) {
                      EXPECT_EQ(shown, "{}");
                      EXPECT_FALSE(state.has("FLDataSeqNum"));
                      EXPECT_EQ(described(extraInfo), "{}");
                      if (size < 13) {
                        EXPECT_THAT(lines, IsEmpty());
                      } else {
                        EXPECT_THAT(lines, ElementsAre("<3>Log code 0x1192 is " + std::to_string(size) +
                                                       " bytes long but must be at least 241 bytes."));
                      }
                    });
}

}  // namespace
}  // namespace varnel
