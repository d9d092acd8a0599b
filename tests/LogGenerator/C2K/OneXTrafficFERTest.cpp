#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/C2KHarness.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* missing = "<4>Log code 0x119d: missing traffic demod subpacket.";

// 42 bytes: the subpacket begins at 17, the frame-erasure flag is the last byte. Bytes that are not read are
// 0xFF.
SubpacketBuilder demodulation(std::uint8_t erasureFlag) {
  return SubpacketBuilder(0x119D).add(11, 25).fill(0xFF).u8(24, erasureFlag);
}
Bytes goodFrame() { return demodulation(0).bytes(); }
Bytes erasedFrame() { return demodulation(1).bytes(); }

// A status outside traffic, with its four subpackets.
Bytes idleStatus() { return SubpacketBuilder(0x119C).add(1, 5).add(2, 14).add(3, 12).add(4, 4).bytes(); }

class OneXTrafficFERTest : public C2KTest {
 protected:
  // What the last of that many erased frames shows.
  std::string afterErasedFrames(int count) {
    std::string shown;
    for (int i = 0; i < count; ++i) shown = published(erasedFrame());
    return shown;
  }
};

TEST_F(OneXTrafficFERTest, AGoodFrameFromAFreshStartShows0) {
  EXPECT_EQ(published(goodFrame()), R"({k1xTrafficFER: "0.00%"})");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  EXPECT_EQ(state.get("TrafficFER").real(), 0.0);
}

TEST_F(OneXTrafficFERTest, AnErasedFrameFromAFreshStartShowsA64th) {
  EXPECT_EQ(published(erasedFrame()), R"({k1xTrafficFER: "1.56%"})");
  EXPECT_EQ(state.get("TrafficFER").real(), 0.015625);
}

TEST_F(OneXTrafficFERTest, AnyFlagBut0MarksAnErasedFrame) {
  for (const std::uint8_t flag : {1, 2, 0x80, 0xFF}) {
    state.remove("TrafficFER");
    EXPECT_EQ(published(demodulation(flag).bytes()), R"({k1xTrafficFER: "1.56%"})") << int{flag};
  }
}

TEST_F(OneXTrafficFERTest, AfterKErasedFramesFromAFreshStartItIs1LessThe63_64thToThePowerOfK) {
  EXPECT_EQ(afterErasedFrames(2), R"({k1xTrafficFER: "3.10%"})");
  EXPECT_EQ(state.get("TrafficFER").real(), 0.031005859375);
  EXPECT_EQ(afterErasedFrames(1), R"({k1xTrafficFER: "4.61%"})");
  EXPECT_EQ(state.get("TrafficFER").real(), 0.046146392822265625);
  EXPECT_EQ(afterErasedFrames(1), R"({k1xTrafficFER: "6.11%"})");
  EXPECT_EQ(afterErasedFrames(1), R"({k1xTrafficFER: "7.57%"})");
  EXPECT_EQ(afterErasedFrames(5), R"({k1xTrafficFER: "14.57%"})");
  EXPECT_EQ(afterErasedFrames(34), R"({k1xTrafficFER: "49.99%"})");
  EXPECT_EQ(afterErasedFrames(20), R"({k1xTrafficFER: "63.50%"})");
  EXPECT_EQ(afterErasedFrames(36), R"({k1xTrafficFER: "79.30%"})");
  EXPECT_EQ(afterErasedFrames(400), R"({k1xTrafficFER: "99.96%"})");
}

TEST_F(OneXTrafficFERTest, EveryStepIsInSinglePrecision) {
  afterErasedFrames(4);
  EXPECT_EQ(state.get("TrafficFER").real(), 0.061050355434417725);
  afterErasedFrames(60);
  EXPECT_EQ(state.get("TrafficFER").real(), 0.6350136399269104);
  // Double precision would show 94.48.
  EXPECT_EQ(afterErasedFrames(120), R"({k1xTrafficFER: "94.49%"})");
  EXPECT_EQ(state.get("TrafficFER").real(), 0.944849967956543);
  EXPECT_EQ(published(idleStatus(), "k1xTrafficFER"), R"~("94.49% (old)")~");
}

TEST_F(OneXTrafficFERTest, ItEndsInTheFixedPointOfSinglePrecision) {
  EXPECT_EQ(afterErasedFrames(2000), R"({k1xTrafficFER: "100.00%"})");
  EXPECT_EQ(state.get("TrafficFER").real(), 0.9999980926513672);
}

TEST_F(OneXTrafficFERTest, GoodFramesLetItDecay) {
  published(erasedFrame());
  EXPECT_EQ(published(goodFrame()), R"({k1xTrafficFER: "1.54%"})");
  EXPECT_EQ(published(goodFrame()), R"({k1xTrafficFER: "1.51%"})");
  EXPECT_EQ(published(goodFrame()), R"({k1xTrafficFER: "1.49%"})");
  EXPECT_EQ(published(goodFrame()), R"({k1xTrafficFER: "1.47%"})");
}

TEST_F(OneXTrafficFERTest, ARateInTheStateIsGoneOnFrom) {
  state.set("TrafficFER", Value::ofReal(1.0));
  EXPECT_EQ(published(erasedFrame()), R"({k1xTrafficFER: "100.00%"})");
  EXPECT_EQ(state.get("TrafficFER").real(), 1.0);
  state.set("TrafficFER", Value::ofReal(0.5));
  EXPECT_EQ(published(goodFrame()), R"({k1xTrafficFER: "49.22%"})");
  EXPECT_EQ(state.get("TrafficFER").real(), 0.4921875);
  state.set("TrafficFER", Value::ofInteger(1));
  EXPECT_EQ(published(goodFrame()), R"({k1xTrafficFER: "98.44%"})");
}

TEST_F(OneXTrafficFERTest, WhatIsNoNumberInTheStateIsAFreshStart) {
  state.set("TrafficFER", "0.5");
  EXPECT_EQ(published(erasedFrame()), R"({k1xTrafficFER: "1.56%"})");
}

TEST_F(OneXTrafficFERTest, LeavingTrafficMakesTheNextCallStartAfresh) {
  afterErasedFrames(3);
  EXPECT_EQ(published(idleStatus(), "k1xTrafficFER"), R"~("4.61% (old)")~");
  EXPECT_EQ(published(idleStatus(), "k1xTrafficFER"), "absent");
  EXPECT_EQ(published(erasedFrame()), R"({k1xTrafficFER: "1.56%"})");
}

// The subpacket.

TEST_F(OneXTrafficFERTest, A16BytePacketIsTooShortAndA17ByteOneLacksItsSubpacket) {
  expectRefused(PacketBuilder(0x119D, 16).u8(14, 1).bytes(),
                "<3>Log code 0x119d is 16 bytes long but must be at least 17 bytes.");
  expectRefused(PacketBuilder(0x119D, 17).u8(14, 1).bytes(), missing);
  expectRefused(PacketBuilder(0x119D, 17).bytes(), missing);
}

TEST_F(OneXTrafficFERTest, WithoutItsSubpacketNothingIsShownAndTheRateStays) {
  state.set("TrafficFER", Value::ofReal(0.5));
  expectRefused(SubpacketBuilder(0x119D).add(1, 25).add(12, 25).bytes(), missing);
  expectRefused(demodulation(1).count(0).bytes(), missing);
  EXPECT_EQ(state.get("TrafficFER").real(), 0.5);
}

TEST_F(OneXTrafficFERTest, TheSubpacketMayStandBehindOthersAndTheFirstOneCounts) {
  SubpacketBuilder packet(0x119D);
  packet.add(1, 7).add(2, 0x0104).fill(11).add(11, 25).u8(24, 0).add(11, 25).u8(24, 1);
  EXPECT_EQ(published(packet.bytes()), R"({k1xTrafficFER: "0.00%"})");
}

TEST_F(OneXTrafficFERTest, ASubpacketOfSize0HoldsTheWalkUntilTheCountRunsOut) {
  expectRefused(SubpacketBuilder(0x119D).add(1, 4, 0).add(11, 25).u8(24, 1).bytes(), missing);
  expectRefused(SubpacketBuilder(0x119D).add(1, 4, 0).add(11, 25).u8(24, 1).count(255).bytes(), missing);
}

TEST_F(OneXTrafficFERTest, AWantedSubpacketOfSize0IsFoundAllTheSame) {
  EXPECT_EQ(published(SubpacketBuilder(0x119D).add(11, 25, 0).u8(24, 1).bytes()),
            R"({k1xTrafficFER: "1.56%"})");
}

TEST_F(OneXTrafficFERTest, AnOversizedSubpacketEndsTheWalk) {
  EXPECT_EQ(published(SubpacketBuilder(0x119D).add(1, 4, 0xFFFF).add(11, 25).u8(24, 1).bytes()), "{}");
  EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Log code error in subpkt#0: bad size (65535).", missing));
  EXPECT_EQ(published(SubpacketBuilder(0x119D).add(1, 4).add(2, 4).add(3, 4, 0x8000).add(11, 25).bytes()),
            "{}");
  EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Log code error in subpkt#2: bad size (32768).", missing));
}

TEST_F(OneXTrafficFERTest, AnOversizedSubpacketBehindTheWantedOneIsNotReached) {
  EXPECT_EQ(published(demodulation(1).add(1, 4, 0xFFFF).bytes()), R"({k1xTrafficFER: "1.56%"})");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(OneXTrafficFERTest, ASubpacketMayEndUpTo16BytesPastThePacketAndNoFurther) {
  // 42 bytes: from 17 on, 41 bytes end at 58, which is 16 past the end.
  EXPECT_EQ(published(SubpacketBuilder(0x119D).add(11, 25, 41).u8(24, 1).bytes()),
            R"({k1xTrafficFER: "1.56%"})");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  EXPECT_EQ(published(SubpacketBuilder(0x119D).add(11, 25, 42).u8(24, 1).bytes()), "{}");
  EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Log code error in subpkt#0: bad size (42).", missing));
}

TEST_F(OneXTrafficFERTest, TheWalkMayStepPastTheEndWhereAllBytesRead0) {
  // The first subpacket ends 16 bytes past the packet; what is there has id 0 and size 0.
  expectRefused(SubpacketBuilder(0x119D).add(1, 25, 41).count(255).bytes(), missing);
}

TEST_F(OneXTrafficFERTest, EveryTruncatedPacketShowsWhatThePrescribedBoundLetsThrough) {
  forEachTruncation(erasedFrame(), [](std::size_t size, const std::string& shown, const auto& lines) {
    if (size < 13) {
      EXPECT_EQ(shown, "{}");
      EXPECT_THAT(lines, IsEmpty());
    } else if (size < 17) {
      EXPECT_EQ(shown, "{}");
      EXPECT_THAT(lines, ElementsAre("<3>Log code 0x119d is " + std::to_string(size) +
                                     " bytes long but must be at least 17 bytes."));
    } else if (size == 17) {
      EXPECT_EQ(shown, "{}");
      EXPECT_THAT(lines, ElementsAre(missing));
    } else if (size >= 20 && size <= 25) {  // it would end at 42
      EXPECT_EQ(shown, "{}");
      EXPECT_THAT(lines, ElementsAre("<3>Log code error in subpkt#0: bad size (25).", missing));
    } else {  // the flag reads as 0; of 18 and 19 bytes, so does the size
      EXPECT_EQ(shown, R"({k1xTrafficFER: "0.00%"})");
      EXPECT_THAT(lines, IsEmpty());
    }
  });
}

}  // namespace
}  // namespace varnel
