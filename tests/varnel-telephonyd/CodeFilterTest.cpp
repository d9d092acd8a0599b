#include "programs/varnel-telephonyd/CodeFilter.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

// Only the header of this log type and code.
Bytes packet(std::uint8_t type, std::uint16_t code) {
  Bytes bytes(13);
  bytes[0] = type;
  bytes[3] = static_cast<std::uint8_t>(code);
  bytes[4] = static_cast<std::uint8_t>(code >> 8);
  return bytes;
}

Bytes prefixed(const Bytes& packet) {
  Bytes bytes{0x81, 0x00};
  bytes.insert(bytes.end(), packet.begin(), packet.end());
  return bytes;
}

TEST(CodeFilter, EachListIsForItsLogType) {
  const CodeFilter filter{CodeFilter::Codes{0xB0C2}, CodeFilter::Codes{1}};
  EXPECT_TRUE(filter.takes(packet(1, 0xB0C2)));
  EXPECT_FALSE(filter.takes(packet(1, 1)));
  EXPECT_TRUE(filter.takes(packet(0xFF, 1)));
  EXPECT_FALSE(filter.takes(packet(0xFF, 0xB0C2)));
}

TEST(CodeFilter, ThePrefixIsLookedThrough) {
  const CodeFilter filter{CodeFilter::Codes{0xB0C2}, CodeFilter::Codes{}};
  EXPECT_TRUE(filter.takes(prefixed(packet(1, 0xB0C2))));
  EXPECT_FALSE(filter.takes(prefixed(packet(1, 0xB0C1))));
}

TEST(CodeFilter, AMissingListAsksForNothing) {
  const CodeFilter filter{CodeFilter::Codes{0xB0C2}, std::nullopt};
  EXPECT_FALSE(filter.takes(packet(0xFF, 0)));
}

TEST(CodeFilter, WithoutAnyListEverythingIsTaken) {
  EXPECT_TRUE(CodeFilter().takes(packet(1, 0xB0C2)));
  EXPECT_TRUE(CodeFilter().takes(packet(0xFF, 0)));
}

TEST(CodeFilter, WhatBearsNoCodeIsTaken) {
  const CodeFilter filter{CodeFilter::Codes{}, CodeFilter::Codes{}};
  EXPECT_TRUE(filter.takes({}));
  EXPECT_TRUE(filter.takes(Bytes(12, 1)));
  EXPECT_TRUE(filter.takes(packet(2, 0xB0C2)));
}

TEST(CodeFilter, APrefixedMessageMayBeAsShortAsItLikes) {
  const CodeFilter filter{CodeFilter::Codes{0x0405}, CodeFilter::Codes{}};
  // Thirteen bytes, of which eleven belong to the packet.
  EXPECT_TRUE(filter.takes(Bytes{0x81, 0, 1, 0, 0, 0x05, 0x04, 0, 0, 0, 0, 0, 0}));
  EXPECT_FALSE(filter.takes(Bytes{0x81, 0, 1, 0, 0, 0x06, 0x04, 0, 0, 0, 0, 0, 0}));
}

}  // namespace
}  // namespace varnel
