#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/C2KHarness.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// 1750 bytes. The counter at 18 counts 128 bits each, so 8 of them are 1024 bits.
PacketBuilder reverse(std::uint32_t sequence, std::uint32_t firstCounter) {
  return PacketBuilder(0x127E, 1750).u32(14, sequence).u32(18, firstCounter);
}

class RLDataRateTest : public C2KTest {
 protected:
  // The rate that the second of two packets shows.
  std::string rate(const PacketBuilder& first, const PacketBuilder& second) {
    state.remove("RLDataSeqNum");
    state.remove("RLDataSent");
    published(first.bytes());
    return published(second.bytes(), "kRLDataRate");
  }
  std::int64_t totalOf(const PacketBuilder& packet) {
    published(packet.bytes());
    return state.get("RLDataSent").integer().value();
  }
};

TEST_F(RLDataRateTest, TheFirstPacketShowsAnEmptyTextAndIsRemembered) {
  EXPECT_EQ(published(reverse(7, 8).bytes()), R"({kRLDataRate: ""})");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  EXPECT_EQ(state.get("RLDataSeqNum").integer(), 7);
  EXPECT_EQ(state.get("RLDataSent").integer(), 1024);
  EXPECT_EQ(described(extraInfo), "{RLDataSeqNum1: 7, RLDataSent1: 1024}");
}

TEST_F(RLDataRateTest, TheSecondPacketShowsTheRateAndBothAreInTheExtraInfo) {
  published(reverse(7, 8).bytes());
  EXPECT_EQ(published(reverse(9, 40).bytes()), R"({kRLDataRate: "2.00 kbps"})");
  EXPECT_EQ(state.get("RLDataSeqNum").integer(), 9);
  EXPECT_EQ(state.get("RLDataSent").integer(), 5120);
  EXPECT_EQ(described(extraInfo),
            "{RLDataSeqNum1: 9, RLDataSent1: 5120, RLDataSeqNum2: 7, RLDataSent2: 1024}");
}

TEST_F(RLDataRateTest, BothDirectionsAreRememberedApart) {
  const auto forward = [](std::uint32_t sequence, std::uint32_t counter) {
    return PacketBuilder(0x1192, 241).u32(13, sequence).u32(17, counter).bytes();
  };
  published(forward(100, 80));
  EXPECT_EQ(published(reverse(7, 8).bytes()), R"({kRLDataRate: ""})");
  EXPECT_EQ(published(forward(101, 88)), R"({kFLDataRate: "1.00 kbps"})");
  EXPECT_EQ(published(reverse(8, 24).bytes()), R"({kRLDataRate: "2.00 kbps"})");
  EXPECT_EQ(described(extraInfo),
            "{FLDataSeqNum1: 101, FLDataSent1: 11264, RLDataSeqNum1: 8, RLDataSent1: 3072, "
            "FLDataSeqNum2: 100, FLDataSent2: 10240, RLDataSeqNum2: 7, RLDataSent2: 1024}");
}

TEST_F(RLDataRateTest, TheRateIsTheDifferenceOverTheSequencesIn1024ths) {
  EXPECT_EQ(rate(reverse(0, 0), reverse(1, 0)), R"("0.00 kbps")");
  EXPECT_EQ(rate(reverse(5, 0), reverse(8, 16)), R"("0.67 kbps")");
  EXPECT_EQ(rate(reverse(1, 16), reverse(2, 8)), R"("-1.00 kbps")");
}

TEST_F(RLDataRateTest, TwoPacketsWithTheSameSequenceShowNoRateButTheSecondIsRemembered) {
  EXPECT_EQ(rate(reverse(7, 8), reverse(7, 16)), "absent");
  EXPECT_EQ(state.get("RLDataSent").integer(), 2048);
  EXPECT_EQ(rate(reverse(7, 8), reverse(6, 16)), "absent");
}

TEST_F(RLDataRateTest, ASequenceThatWrapsStillGivesAPositiveDelta) {
  EXPECT_EQ(rate(reverse(0xFFFFFFFF, 0), reverse(1, 8)), R"("0.50 kbps")");
  EXPECT_EQ(rate(reverse(0x7FFFFFFF, 0), reverse(0x80000000, 8)), R"("1.00 kbps")");
  EXPECT_EQ(rate(reverse(0, 0), reverse(0x80000000, 8)), "absent");
}

TEST_F(RLDataRateTest, EachOfThe12RatesCounts24CountersWithItsWeight) {
  constexpr std::int64_t weights[12] = {128, 256, 512, 768, 1024, 1536, 2048, 3072, 4096, 6144, 8192, 12288};
  // Of rate 0; those of the next rate lie 24 bytes further on.
  constexpr std::size_t counters[24] = {18,  22,  26,  30,  306,  310,  314,  318,  594,  598,  602,  606,
                                        882, 886, 890, 894, 1170, 1174, 1178, 1182, 1458, 1462, 1466, 1470};
  for (std::size_t rateIndex = 0; rateIndex < 12; ++rateIndex) {
    for (const std::size_t counter : counters) {
      const std::size_t offset = counter + 24 * rateIndex;
      EXPECT_EQ(totalOf(PacketBuilder(0x127E, 1750).u32(offset, 3)), 3 * weights[rateIndex])
          << "offset " << offset;
    }
  }
}

TEST_F(RLDataRateTest, OfEachRecordTheLast8BytesAreNotCounted) {
  // The records of 24 bytes fill 18 to 1745.
  for (std::size_t record = 18; record < 1746; record += 24) {
    EXPECT_EQ(totalOf(PacketBuilder(0x127E, 1750).u32(record + 16, 3).u32(record + 20, 3)), 0)
        << "record at " << record;
  }
}

TEST_F(RLDataRateTest, TheTotalIsTheSumOfAllCountersIn64Bits) {
  // The weights add up to 40064, each of them for 24 counters.
  EXPECT_EQ(totalOf(PacketBuilder(0x127E, 1750).fill(0xFF)), 4294967295 * 24 * 40064);
  EXPECT_EQ(totalOf(PacketBuilder(0x127E, 1800).fill(0xFF)), 4294967295 * 24 * 40064);
}

TEST_F(RLDataRateTest, TheByteBeforeTheSequenceAndTheLastFourAreNotRead) {
  EXPECT_EQ(totalOf(reverse(7, 8).u8(13, 0xFF).u32(1746, 0xFFFFFFFF)), 1024);
  EXPECT_EQ(state.get("RLDataSeqNum").integer(), 7);
}

TEST_F(RLDataRateTest, A1749BytePacketIsRefusedAndA1750ByteOneIsNot) {
  expectRefused(PacketBuilder(0x127E, 1749).bytes(),
                "<3>Log code 0x127e is 1749 bytes long but must be at least 1750 bytes.");
  EXPECT_EQ(published(PacketBuilder(0x127E, 1750).bytes()), R"({kRLDataRate: ""})");
}

TEST_F(RLDataRateTest, EveryTruncatedPacketIsRefusedAndLeavesNoTrace) {
  forEachTruncation(reverse(7, 8).bytes(),
                    [&](std::size_t size, const std::string& shown, const auto& lines) {
                      EXPECT_EQ(shown, "{}");
                      EXPECT_FALSE(state.has("RLDataSeqNum"));
                      EXPECT_EQ(described(extraInfo), "{}");
                      if (size < 13) {
                        EXPECT_THAT(lines, IsEmpty());
                      } else {
                        EXPECT_THAT(lines, ElementsAre("<3>Log code 0x127e is " + std::to_string(size) +
                                                       " bytes long but must be at least 1750 bytes."));
                      }
                    });
}

}  // namespace
}  // namespace varnel
