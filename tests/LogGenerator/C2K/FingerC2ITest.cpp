#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/C2KHarness.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

struct Finger {
  std::uint16_t pn, c2i;
};

// Bytes that the decoder does not read are 0xFF.
Bytes fingers(const std::vector<Finger>& list) {
  PacketBuilder packet(0x108A, 23 + 14 * list.size());
  packet.fill(0xFF).u8(22, static_cast<std::uint8_t>(list.size()));
  std::size_t record = 23;
  for (const Finger& finger : list) {
    packet.u16(record, finger.pn).u16(record + 6, finger.c2i);
    record += 14;
  }
  return packet.bytes();
}

class FingerC2ITest : public C2KTest {
 protected:
  std::string shownC2I(std::uint16_t c2i) {
    published(fingers({{7, c2i}}));
    const Dictionary* rows = display.dictionary()->get("kFingerC2I").dictionary();
    return rows ? described(rows->get("0;7")) : "no fingers";
  }
};

TEST_F(FingerC2ITest, ShowsEachFingerWithItsC2I) {
  EXPECT_EQ(published(fingers({{420, 512}, {84, 256}, {84, 5120}})),
            R"({kFingerC2I: {_sorted: "_sorted", 0;420: "+0.00 dB", 1;84: "-3.01 dB", 2;84: "+10.00 dB"}})");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(FingerC2ITest, WithoutFingersItIsNone) {
  EXPECT_EQ(published(fingers({})), R"~({kFingerC2I: "(none)"})~");
}

TEST_F(FingerC2ITest, UnassignedFingersAreSkippedButStillCount) {
  EXPECT_EQ(published(fingers({{0xFFFF, 512}, {84, 512}, {0xFFFF, 512}, {0xFFFE, 1024}})),
            R"({kFingerC2I: {_sorted: "_sorted", 1;84: "+0.00 dB", 3;65534: "+3.01 dB"}})");
}

TEST_F(FingerC2ITest, WhenAllFingersAreUnassignedItIsNone) {
  EXPECT_EQ(published(fingers({{0xFFFF, 512}})), R"~({kFingerC2I: "(none)"})~");
  EXPECT_EQ(published(fingers({{0xFFFF, 512}, {0xFFFF, 1}, {0xFFFF, 0}})), R"~({kFingerC2I: "(none)"})~");
}

TEST_F(FingerC2ITest, TheC2ICountsIn512thsAndIsShownInDecibels) {
  EXPECT_EQ(shownC2I(512), R"("+0.00 dB")");
  EXPECT_EQ(shownC2I(1), R"("-27.09 dB")");
  EXPECT_EQ(shownC2I(511), R"("-0.01 dB")");
  EXPECT_EQ(shownC2I(0x8000), R"("+18.06 dB")");
  EXPECT_EQ(shownC2I(0xFFFF), R"("+21.07 dB")");
}

TEST_F(FingerC2ITest, AC2IOf0IsMinusInfinity) { EXPECT_EQ(shownC2I(0), R"("-inf dB")"); }

TEST_F(FingerC2ITest, TheOtherFieldsAreNotRead) {
  Bytes packet = fingers({{1, 512}, {2, 256}});
  const std::string shown = published(packet);
  for (const std::size_t offset : {13u, 21u, 25u, 28u, 31u, 36u, 39u, 42u, 45u, 50u}) packet[offset] = 0;
  EXPECT_EQ(published(packet), shown);
}

TEST_F(FingerC2ITest, A22BytePacketIsRefusedAndA23ByteOneIsNot) {
  expectRefused(PacketBuilder(0x108A, 22).bytes(),
                "<3>Log code 0x108a is 22 bytes long but must be at least 23 bytes.");
  expectRefused(PacketBuilder(0x108A, 13).bytes(),
                "<3>Log code 0x108a is 13 bytes long but must be at least 23 bytes.");
  EXPECT_EQ(published(PacketBuilder(0x108A, 23).bytes()), R"~({kFingerC2I: "(none)"})~");
}

TEST_F(FingerC2ITest, ALengthThatDoesNotMatchTheFingersIsRefusedWithTheSizeOfThePacketWithoutFingers) {
  expectRefused(PacketBuilder(0x108A, 36).u8(22, 1).bytes(),
                "<3>Log code 0x108a has bad length of 36 bytes, but has 1 substructs (size=23).");
  expectRefused(PacketBuilder(0x108A, 38).u8(22, 1).bytes(),
                "<3>Log code 0x108a has bad length of 38 bytes, but has 1 substructs (size=23).");
  expectRefused(PacketBuilder(0x108A, 24).bytes(),
                "<3>Log code 0x108a has bad length of 24 bytes, but has 0 substructs (size=23).");
  expectRefused(PacketBuilder(0x108A, 37).u8(22, 255).bytes(),
                "<3>Log code 0x108a has bad length of 37 bytes, but has 255 substructs (size=23).");
}

TEST_F(FingerC2ITest, The255FingersOfAFullPacketAreShown) {
  std::vector<Finger> list(255, Finger{9, 512});
  list[254] = {300, 1024};
  EXPECT_THAT(published(fingers(list)), HasSubstr(R"(, 253;9: "+0.00 dB", 254;300: "+3.01 dB"}})"));
  EXPECT_EQ(display.dictionary()->get("kFingerC2I").dictionary()->size(), 256u);
}

TEST_F(FingerC2ITest, EveryTruncatedPacketIsRefused) {
  const Bytes packet = fingers({{420, 512}, {84, 256}});
  forEachTruncation(packet, [](std::size_t size, const std::string& shown, const auto& lines) {
    EXPECT_EQ(shown, "{}");
    const std::string length = std::to_string(size) + " bytes";
    if (size < 13) {
      EXPECT_THAT(lines, IsEmpty());
    } else if (size < 23) {
      EXPECT_THAT(lines,
                  ElementsAre("<3>Log code 0x108a is " + length + " long but must be at least 23 bytes."));
    } else {
      EXPECT_THAT(lines, ElementsAre("<3>Log code 0x108a has bad length of " + length +
                                     ", but has 2 substructs (size=23)."));
    }
  });
}

}  // namespace
}  // namespace varnel
