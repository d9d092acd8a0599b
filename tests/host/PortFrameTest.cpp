#include "host/PortFrame.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace varnel {
namespace {

using testing::ElementsAre;

struct OwnedFrame {
  std::int32_t identifier;
  FrameMark mark;
  Bytes payload;

  friend bool operator==(const OwnedFrame&, const OwnedFrame&) = default;
};

std::vector<OwnedFrame> framesOf(FrameReader& reader) {
  std::vector<OwnedFrame> frames;
  while (const auto frame = reader.next())
    frames.push_back({frame->identifier, frame->mark, Bytes(frame->payload.begin(), frame->payload.end())});
  return frames;
}

// A request with identifier -2 and three bytes, then an empty notification with identifier 258.
const Bytes twoFrames = {3, 0, 0, 0, 0xFE, 0xFF, 0xFF, 0xFF, 1, 0xA, 0xB, 0xC,  //
                         0, 0, 0, 0, 2,    1,    0,    0,    3};

TEST(PortFrame, IsLengthIdentifierMarkAndPayload) {
  Bytes bytes;
  appendFrame(bytes, {-2, FrameMark::Request, Bytes{0xA, 0xB, 0xC}});
  appendFrame(bytes, {258, FrameMark::Notification, {}});
  EXPECT_EQ(bytes, twoFrames);
}

TEST(FrameReader, FindsTheFramesWhereverTheBytesAreSplit) {
  for (std::size_t split = 0; split <= twoFrames.size(); ++split) {
    FrameReader reader;
    const ByteView bytes(twoFrames);
    reader.feed(bytes.first(split));
    auto frames = framesOf(reader);
    EXPECT_EQ(frames.size(), split < 12 ? 0u : split < 21 ? 1u : 2u) << "split at " << split;
    reader.feed(bytes.subspan(split));
    for (auto& frame : framesOf(reader)) frames.push_back(std::move(frame));
    EXPECT_THAT(frames, ElementsAre(OwnedFrame{-2, FrameMark::Request, {0xA, 0xB, 0xC}},
                                    OwnedFrame{258, FrameMark::Notification, {}}))
        << "split at " << split;
    EXPECT_FALSE(reader.isFaulty());
  }
}

TEST(FrameReader, TakesBytesOneByOne) {
  FrameReader reader;
  std::size_t count = 0;
  for (const std::uint8_t byte : twoFrames) {
    reader.feed({&byte, 1});
    count += framesOf(reader).size();
  }
  EXPECT_EQ(count, 2u);
}

TEST(FrameReader, KnowsEveryMark) {
  FrameReader reader;
  for (std::uint8_t mark = 0; mark <= 4; ++mark) reader.feed(Bytes{0, 0, 0, 0, 0, 0, 0, 0, mark});
  EXPECT_THAT(framesOf(reader),
              ElementsAre(OwnedFrame{0, FrameMark::Message, {}}, OwnedFrame{0, FrameMark::Request, {}},
                          OwnedFrame{0, FrameMark::Reply, {}}, OwnedFrame{0, FrameMark::Notification, {}},
                          OwnedFrame{0, FrameMark::NoReply, {}}));
}

TEST(FrameReader, TakesAPayloadOfOneMebibyte) {
  FrameReader reader;
  reader.feed(Bytes{0, 0, 0x10, 0, 7, 0, 0, 0, 0});
  EXPECT_FALSE(reader.next());
  reader.feed(Bytes(1048575, 0x55));
  EXPECT_FALSE(reader.next());
  reader.feed(Bytes{0x66});
  const auto frame = reader.next();
  ASSERT_TRUE(frame);
  EXPECT_EQ(frame->payload.size(), 1048576u);
  EXPECT_EQ(frame->payload.back(), 0x66);
}

TEST(FrameReader, RefusesAByteMoreBeforeItArrives) {
  FrameReader reader;
  reader.feed(Bytes{1, 0, 0x10, 0, 7, 0, 0, 0, 0});
  EXPECT_FALSE(reader.next());
  EXPECT_TRUE(reader.isFaulty());
}

TEST(FrameReader, RefusesAnUnknownMarkAndWhateverFollows) {
  FrameReader reader;
  reader.feed(twoFrames);
  reader.feed(Bytes{0, 0, 0, 0, 0, 0, 0, 0, 5});
  reader.feed(twoFrames);
  EXPECT_EQ(framesOf(reader).size(), 2u);
  EXPECT_TRUE(reader.isFaulty());
  reader.feed(twoFrames);
  EXPECT_FALSE(reader.next());
}

}  // namespace
}  // namespace varnel
