#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/C2KHarness.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

struct Pilot {
  std::uint16_t pn, strength;
};

// Bytes that the decoder does not read are 0xFF.
Bytes activeSet(const std::vector<Pilot>& pilots) {
  PacketBuilder packet(0x12B6, 25 + 12 * pilots.size());
  packet.fill(0xFF).u8(15, static_cast<std::uint8_t>(pilots.size()));
  std::size_t record = 25;
  for (const Pilot& pilot : pilots) {
    packet.u16(record, pilot.pn).u16(record + 2, pilot.strength);
    record += 12;
  }
  return packet.bytes();
}

class EVDOActiveSetTest : public C2KTest {
 protected:
  std::string shownStrength(std::uint16_t strength) {
    published(activeSet({{7, strength}}));
    const Dictionary* pilots = display.dictionary()->get("kActiveSetPilots").dictionary();
    return pilots ? described(pilots->get("0;7")) : "no pilots";
  }
};

TEST_F(EVDOActiveSetTest, ShowsEachPilotWithItsStrength) {
  EXPECT_EQ(published(activeSet({{420, 512}, {84, 256}, {511, 1}})),
            R"({kActiveSetPilots: {_sorted: "_sorted", 0;420: "+0.00 dB", 1;84: "-3.01 dB", )"
            R"(2;511: "-27.09 dB"}})");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(EVDOActiveSetTest, WithoutPilotsItIsNone) {
  EXPECT_EQ(published(activeSet({})), R"~({kActiveSetPilots: "(none)"})~");
}

TEST_F(EVDOActiveSetTest, EachPacketLeavesItsOwnPilotsAlone) {
  const auto shown = [&](const std::vector<Pilot>& pilots) {
    generator.updateState_withData(state, activeSet(pilots));
    return described(display.dictionary()->get("kActiveSetPilots"));
  };
  EXPECT_EQ(shown({{1, 512}, {2, 256}, {3, 512}}),
            R"({_sorted: "_sorted", 0;1: "+0.00 dB", 1;2: "-3.01 dB", 2;3: "+0.00 dB"})");
  EXPECT_EQ(shown({{2, 256}}), R"({_sorted: "_sorted", 0;2: "-3.01 dB"})");
  EXPECT_EQ(shown({{2, 512}, {9, 256}}), R"({_sorted: "_sorted", 0;2: "+0.00 dB", 1;9: "-3.01 dB"})");
  EXPECT_EQ(shown({}), R"~("(none)")~");
  EXPECT_EQ(shown({{4, 512}}), R"({_sorted: "_sorted", 0;4: "+0.00 dB"})");
}

TEST_F(EVDOActiveSetTest, PilotsThatSomebodyHoldsStayAsTheyWere) {
  generator.updateState_withData(state, activeSet({{1, 512}, {2, 256}}));
  const Value held = display.dictionary()->get("kActiveSetPilots");
  generator.updateState_withData(state, activeSet({{7, 512}}));
  EXPECT_EQ(described(held), R"({_sorted: "_sorted", 0;1: "+0.00 dB", 1;2: "-3.01 dB"})");
  EXPECT_EQ(described(display.dictionary()->get("kActiveSetPilots")),
            R"({_sorted: "_sorted", 0;7: "+0.00 dB"})");
}

TEST_F(EVDOActiveSetTest, TheStrengthCountsIn512thsAndIsShownInDecibels) {
  EXPECT_EQ(shownStrength(512), R"("+0.00 dB")");
  EXPECT_EQ(shownStrength(256), R"("-3.01 dB")");
  EXPECT_EQ(shownStrength(1024), R"("+3.01 dB")");
  EXPECT_EQ(shownStrength(5120), R"("+10.00 dB")");
  EXPECT_EQ(shownStrength(511), R"("-0.01 dB")");
  EXPECT_EQ(shownStrength(513), R"("+0.01 dB")");
  EXPECT_EQ(shownStrength(51), R"("-10.02 dB")");
  EXPECT_EQ(shownStrength(1), R"("-27.09 dB")");
  EXPECT_EQ(shownStrength(0x8000), R"("+18.06 dB")");
  EXPECT_EQ(shownStrength(0xFFFF), R"("+21.07 dB")");
}

TEST_F(EVDOActiveSetTest, AStrengthOf0IsMinusInfinity) { EXPECT_EQ(shownStrength(0), R"("-inf dB")"); }

TEST_F(EVDOActiveSetTest, NoPNIsFilteredAndEqualOnesStandSideBySide) {
  EXPECT_EQ(published(activeSet({{0xFFFF, 512}, {0, 512}, {0xFFFF, 1024}})),
            R"({kActiveSetPilots: {_sorted: "_sorted", 0;65535: "+0.00 dB", 1;0: "+0.00 dB", )"
            R"(2;65535: "+3.01 dB"}})");
}

TEST_F(EVDOActiveSetTest, TheOtherFieldsAreNotRead) {
  Bytes packet = activeSet({{1, 512}, {2, 256}});
  const std::string shown = published(packet);
  for (const std::size_t offset : {13u, 14u, 16u, 20u, 24u, 29u, 36u, 41u, 48u}) packet[offset] = 0;
  EXPECT_EQ(published(packet), shown);
}

TEST_F(EVDOActiveSetTest, A24BytePacketIsRefusedAndA25ByteOneIsNot) {
  expectRefused(PacketBuilder(0x12B6, 24).bytes(),
                "<3>Log code 0x12b6 is 24 bytes long but must be at least 25 bytes.");
  expectRefused(PacketBuilder(0x12B6, 13).bytes(),
                "<3>Log code 0x12b6 is 13 bytes long but must be at least 25 bytes.");
  EXPECT_EQ(published(PacketBuilder(0x12B6, 25).bytes()), R"~({kActiveSetPilots: "(none)"})~");
}

TEST_F(EVDOActiveSetTest, APacketOneByteShortOfItsPilotsIsRefused) {
  expectRefused(PacketBuilder(0x12B6, 36).u8(15, 1).bytes(),
                "<3>Log code 0x12b6 is 36 bytes long, but has 1 substructs.");
  expectRefused(PacketBuilder(0x12B6, 48).u8(15, 2).bytes(),
                "<3>Log code 0x12b6 is 48 bytes long, but has 2 substructs.");
  expectRefused(PacketBuilder(0x12B6, 3084).u8(15, 255).bytes(),
                "<3>Log code 0x12b6 is 3084 bytes long, but has 255 substructs.");
}

TEST_F(EVDOActiveSetTest, BytesBehindThePilotsDoNoHarm) {
  Bytes packet = activeSet({{3, 512}});
  packet.resize(packet.size() + 1, 0xFF);
  EXPECT_EQ(published(packet), R"({kActiveSetPilots: {_sorted: "_sorted", 0;3: "+0.00 dB"}})");
  packet.resize(packet.size() + 100, 0xFF);
  EXPECT_EQ(published(packet), R"({kActiveSetPilots: {_sorted: "_sorted", 0;3: "+0.00 dB"}})");
}

TEST_F(EVDOActiveSetTest, The255PilotsOfAFullPacketAreShown) {
  std::vector<Pilot> pilots(255, Pilot{9, 512});
  pilots[254] = {300, 1024};
  const std::string shown = published(activeSet(pilots));
  EXPECT_THAT(shown, HasSubstr(R"(, 253;9: "+0.00 dB", 254;300: "+3.01 dB"}})"));
  EXPECT_EQ(display.dictionary()->get("kActiveSetPilots").dictionary()->size(), 256u);
}

TEST_F(EVDOActiveSetTest, EveryTruncatedPacketIsRefused) {
  const Bytes packet = activeSet({{420, 512}, {84, 256}});
  forEachTruncation(packet, [](std::size_t size, const std::string& shown, const auto& lines) {
    EXPECT_EQ(shown, "{}");
    const std::string beginning = "<3>Log code 0x12b6 is " + std::to_string(size) + " bytes long";
    if (size < 13) {
      EXPECT_THAT(lines, IsEmpty());
    } else if (size < 25) {
      EXPECT_THAT(lines, ElementsAre(beginning + " but must be at least 25 bytes."));
    } else {
      EXPECT_THAT(lines, ElementsAre(beginning + ", but has 2 substructs."));
    }
  });
}

}  // namespace
}  // namespace varnel
