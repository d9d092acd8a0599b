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

// The length of a frame and the processor decide how the frame is checked.
TEST(FrameChecksum, OfEveryLengthFindsEveryBitThatIsTurned) {
  Bytes contents;
  for (int i = 0; i < 100; ++i) {
    Bytes frame = contents;
    const std::uint16_t checksum = example::slowChecksum(contents);
    frame.insert(frame.end(),
                 {static_cast<std::uint8_t>(checksum), static_cast<std::uint8_t>(checksum >> 8)});
    ASSERT_TRUE(isSound(frame)) << i;
    for (std::size_t bit = 0; bit < 8 * frame.size(); ++bit) {
      frame[bit / 8] ^= static_cast<std::uint8_t>(1 << bit % 8);
      ASSERT_FALSE(isSound(frame)) << i << ' ' << bit;
      frame[bit / 8] ^= static_cast<std::uint8_t>(1 << bit % 8);
    }
    contents.push_back(static_cast<std::uint8_t>(i * 151 + 7));
  }
}

// All sixteen bits of the checksum count, and no others.
TEST(FrameChecksum, OneOf65536EndsMakesAFrameSound) {
  for (const std::size_t length : {5U, 14U, 31U, 60U}) {
    Bytes frame(length + 2, 0x5A);
    int sound = 0;
    for (unsigned end = 0; end <= 0xFFFF; ++end) {
      frame[length] = static_cast<std::uint8_t>(end);
      frame[length + 1] = static_cast<std::uint8_t>(end >> 8);
      sound += isSound(frame) ? 1 : 0;
    }
    EXPECT_EQ(sound, 1) << length;
  }
}

}  // namespace
}  // namespace varnel
