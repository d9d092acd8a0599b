#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/C2KHarness.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// Bytes that the decoder does not read are 0xFF.
PacketBuilder systemInfo(std::size_t size = 186) {
  PacketBuilder packet(0x134F, size);
  packet.fill(0xFF).u8(13, 2).u32(42, 6).u32(46, 2).u16(50, 4139).u16(52, 0x0102).u8(131, 3).u8(133, 6);
  return size < 186 ? packet : packet.u16(184, 0x1234);
}

constexpr const char* shownWithBaseId =
    R"({k1xRoamingHome: "Available system [6]", kSystemId: "4139", kNetworkId: "258", )"
    R"(kPacketZoneId: "3", kBaseId: "4660", kProtocolRevision: "6"})";
constexpr const char* shownWithoutBaseId =
    R"({k1xRoamingHome: "Available system [6]", kSystemId: "4139", kNetworkId: "258", )"
    R"(kPacketZoneId: "3", kProtocolRevision: "6"})";

class SystemInfoTest : public C2KTest {};

TEST_F(SystemInfoTest, ShowsSixVariablesInThisOrder) {
  EXPECT_EQ(published(systemInfo().bytes()), shownWithBaseId);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  EXPECT_EQ(published(systemInfo(400).bytes()), shownWithBaseId);
}

TEST_F(SystemInfoTest, TheMinimumIs171BytesThoughTheBaseIdLiesBehindThem) {
  expectRefused(systemInfo(170).bytes(),
                "<3>Log code 0x134f is 170 bytes long but must be at least 171 bytes.");
  EXPECT_EQ(published(systemInfo(171).bytes()), shownWithoutBaseId);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(SystemInfoTest, ABaseIdThatIsNotWhollyInsideThePacketIsNotPublished) {
  EXPECT_EQ(published(systemInfo(184).bytes()), shownWithoutBaseId);
  EXPECT_EQ(published(systemInfo(185).bytes()), shownWithoutBaseId);
  EXPECT_EQ(published(systemInfo(186).bytes()), shownWithBaseId);
}

TEST_F(SystemInfoTest, EveryTruncatedPacketIsRefusedBelow171BytesAndElseLacksTheBaseId) {
  forEachTruncation(systemInfo().bytes(), [](std::size_t size, const std::string& shown, const auto& lines) {
    if (size < 13) {
      EXPECT_EQ(shown, "{}");
      EXPECT_THAT(lines, IsEmpty());
    } else if (size < 171) {
      EXPECT_EQ(shown, "{}");
      EXPECT_THAT(lines, ElementsAre("<3>Log code 0x134f is " + std::to_string(size) +
                                     " bytes long but must be at least 171 bytes."));
    } else {
      EXPECT_EQ(shown, shownWithoutBaseId);
      EXPECT_THAT(lines, IsEmpty());
    }
  });
}

TEST_F(SystemInfoTest, VersionsBelow2AreDropped) {
  expectRefused(systemInfo().u8(13, 1).bytes(),
                "<3>Log code 0x134f has version=1; only version 2 or higher expected; dropping.");
  expectRefused(systemInfo().u8(13, 0).bytes(),
                "<3>Log code 0x134f has version=0; only version 2 or higher expected; dropping.");
}

TEST_F(SystemInfoTest, LaterVersionsAreShown) {
  EXPECT_EQ(published(systemInfo().u8(13, 3).bytes()), shownWithBaseId);
  EXPECT_EQ(published(systemInfo().u8(13, 255).bytes()), shownWithBaseId);
}

TEST_F(SystemInfoTest, TheLengthIsCheckedBeforeTheVersion) {
  expectRefused(systemInfo(170).u8(13, 1).bytes(),
                "<3>Log code 0x134f is 170 bytes long but must be at least 171 bytes.");
}

TEST_F(SystemInfoTest, EachRoamingIndicatorHasItsText) {
  const auto shown = [&](std::uint32_t value) {
    return published(systemInfo().u32(42, value).bytes(), "k1xRoamingHome");
  };
  EXPECT_EQ(shown(0), R"("OFF [0]")");
  EXPECT_EQ(shown(1), R"("ON [1]")");
  EXPECT_EQ(shown(2), R"("Flashing [2]")");
  EXPECT_EQ(shown(3), R"("Out of Neighborhood [3]")");
  EXPECT_EQ(shown(4), R"("Out of Building [4]")");
  EXPECT_EQ(shown(5), R"("Preferred system [5]")");
  EXPECT_EQ(shown(6), R"("Available system [6]")");
  EXPECT_EQ(shown(7), R"("Alliance partner [7]")");
  EXPECT_EQ(shown(8), R"("Premium partner [8]")");
  EXPECT_EQ(shown(9), R"("Full service functionality [9]")");
  EXPECT_EQ(shown(10), R"("Partial service functionality [10]")");
  EXPECT_EQ(shown(11), R"("Banner ON [11]")");
  EXPECT_EQ(shown(12), R"("Banner OFF [12]")");
}

TEST_F(SystemInfoTest, OtherRoamingIndicatorsShowTheirSignedNumber) {
  const auto shown = [&](std::uint32_t value) {
    return published(systemInfo().u32(42, value).bytes(), "k1xRoamingHome");
  };
  EXPECT_EQ(shown(13), R"("ERI - 13")");
  EXPECT_EQ(shown(0x100), R"("ERI - 256")");
  EXPECT_EQ(shown(0x7FFFFFFF), R"("ERI - 2147483647")");
  EXPECT_EQ(shown(0xFFFFFFFF), R"("ERI - -1")");
  EXPECT_EQ(shown(0x80000000), R"("ERI - -2147483648")");
}

TEST_F(SystemInfoTest, OfOtherSystemTypesSystemAndNetworkAreUnknown) {
  const auto shown = [&](std::uint32_t type) {
    const std::string system = published(systemInfo().u32(46, type).bytes(), "kSystemId");
    return system + " " + described(display.dictionary()->get("kNetworkId"));
  };
  EXPECT_EQ(shown(2), R"("4139" "258")");
  EXPECT_EQ(shown(0), R"~("(unknown system type 0)" "(unknown system type 0)")~");
  EXPECT_EQ(shown(1), R"~("(unknown system type 1)" "(unknown system type 1)")~");
  EXPECT_EQ(shown(3), R"~("(unknown system type 3)" "(unknown system type 3)")~");
  EXPECT_EQ(shown(0x102), R"~("(unknown system type 258)" "(unknown system type 258)")~");
  EXPECT_EQ(shown(0x10002), R"~("(unknown system type 65538)" "(unknown system type 65538)")~");
  EXPECT_EQ(shown(0xFFFFFFFF), R"~("(unknown system type -1)" "(unknown system type -1)")~");
  EXPECT_EQ(shown(0x80000000),
            R"~("(unknown system type -2147483648)" "(unknown system type -2147483648)")~");
}

TEST_F(SystemInfoTest, NumbersAreUnsigned) {
  EXPECT_EQ(published(systemInfo().u16(50, 0xFFFF).bytes(), "kSystemId"), R"("65535")");
  EXPECT_EQ(published(systemInfo().u16(52, 0x8000).bytes(), "kNetworkId"), R"("32768")");
  EXPECT_EQ(published(systemInfo().u8(131, 0xFF).bytes(), "kPacketZoneId"), R"("255")");
  EXPECT_EQ(published(systemInfo().u8(133, 0x80).bytes(), "kProtocolRevision"), R"("128")");
  EXPECT_EQ(published(systemInfo().u16(184, 0xFFFF).bytes(), "kBaseId"), R"("65535")");
}

TEST_F(SystemInfoTest, AllZerosAreShown) {
  EXPECT_EQ(published(PacketBuilder(0x134F, 186).u8(13, 2).bytes()),
            R"~({k1xRoamingHome: "OFF [0]", kSystemId: "(unknown system type 0)", )~"
            R"~(kNetworkId: "(unknown system type 0)", kPacketZoneId: "0", kBaseId: "0", )~"
            R"~(kProtocolRevision: "0"})~");
}

}  // namespace
}  // namespace varnel
