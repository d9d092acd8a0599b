#include "host/captures/FrameChecksum.h"

#include "tests/host/captures/CaptureFiles.h"

namespace varnel {
namespace {

TEST(FrameChecksum, OfTheDigitsIs0x906E) {
  EXPECT_EQ(frameChecksum(Bytes{'1', '2', '3', '4', '5', '6', '7', '8', '9'}), 0x906E);
  EXPECT_EQ(frameChecksum(Bytes{}), 0x0000);
}

TEST(FrameChecksum, IsTheSameAtEveryLengthAsBitByBit) {
  Bytes bytes;
  for (int i = 0; i < 100; ++i) {
    ASSERT_EQ(frameChecksum(bytes), example::slowChecksum(bytes)) << i;
    bytes.push_back(static_cast<std::uint8_t>(i * 151 + 7));
  }
}

TEST(FrameChecksum, FindsEveryBitThatIsTurned) {
  Bytes frame = example::answerFrame;
  frame.pop_back();
  EXPECT_TRUE(isSound(frame));
  for (std::size_t bit = 0; bit < 8 * frame.size(); ++bit) {
    frame[bit / 8] ^= static_cast<std::uint8_t>(1 << bit % 8);
    EXPECT_FALSE(isSound(frame)) << bit;
    frame[bit / 8] ^= static_cast<std::uint8_t>(1 << bit % 8);
  }
}

}  // namespace
}  // namespace varnel
