#include "LogGenerator/KLV/GSMUMTS/ActiveSet.h"

#include "tests/LogGenerator/KLV/GSMUMTS/CellSetPacket.h"
#include "tests/support/DecoderHarness.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr const char* trace = "<4>ActiveSet";

class ActiveSetTest : public ListDecoderTest<ActiveSet, cellSetCode> {
 protected:
  void decodeCells(std::int16_t reading, const std::vector<MeasuredCell>& cells) {
    decode(cellSetPacket(reading, cells).bytes());
  }
  /// What the only cell of a set shows for the reading and the energies.
  std::string shownRscp(std::int16_t reading, std::uint32_t energy) {
    decodeCells(reading, {{1, {energy, 0, 0}}});
    return shown("RSCP");
  }
  std::string shownEnergy(const std::array<std::uint32_t, 3>& energies) {
    decodeCells(0, {{1, energies}});
    return shown("Energy Per Chip");
  }
};

// Two cells; the energy of the first has two bytes at 78, that of the second two at 130.
Bytes twoCells() { return cellSetPacket(-200, {{0x1234, {60000, 1, 1}}, {0x0102, {0, 0, 5000}}}).bytes(); }

std::string row(int scramblingCode, int rscp, int energy) {
  return "{Scrambling Code: \"" + std::to_string(scramblingCode) + "\", RSCP: \"" + std::to_string(rscp) +
         " dB\", Energy Per Chip: \"" + std::to_string(energy) + " dB\"}";
}

TEST_F(ActiveSetTest, EachCellHasThreeEntriesInThisOrder) {
  decode(twoCells());
  EXPECT_EQ(shown(), R"([{Scrambling Code: "4660", RSCP: "-85 dB", Energy Per Chip: "-10 dB"}, )"
                     R"({Scrambling Code: "258", RSCP: "-96 dB", Energy Per Chip: "-21 dB"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ActiveSetTest, AReadingOfMinus512WithMinus10DbShowsMinus116) {
  EXPECT_EQ(shownRscp(-512, 60000), R"("-116 dB")");
}

TEST_F(ActiveSetTest, AReadingOfMinus505WithMinus10DbShowsMinus116AsWell) {
  EXPECT_EQ(shownRscp(-505, 60000), R"("-116 dB")");
}

TEST_F(ActiveSetTest, TheReadingIsTruncatedTowardsZeroOnEitherSide) {
  EXPECT_EQ(shownRscp(-513, 0), R"("-106 dB")");
  EXPECT_EQ(shownRscp(-521, 0), R"("-106 dB")");
  EXPECT_EQ(shownRscp(-522, 0), R"("-107 dB")");
  EXPECT_EQ(shownRscp(-503, 0), R"("-106 dB")");
  EXPECT_EQ(shownRscp(-502, 0), R"("-105 dB")");
  EXPECT_EQ(shownRscp(0, 0), R"("-55 dB")");
}

TEST_F(ActiveSetTest, TheReadingIsSignedAndItsSumIsNotCutTo16Bits) {
  EXPECT_EQ(shownRscp(32767, 0), R"("3221 dB")");
  EXPECT_EQ(shownRscp(-32768, 0), R"("-3331 dB")");
}

TEST_F(ActiveSetTest, Energies0And0And5000Use5000) { EXPECT_EQ(shownEnergy({0, 0, 5000}), R"("-21 dB")"); }

TEST_F(ActiveSetTest, TheFirstEnergyThatIsNotZeroIsUsed) {
  EXPECT_EQ(shownEnergy({60000, 5000, 814}), R"("-10 dB")");
  EXPECT_EQ(shownEnergy({0, 5000, 60000}), R"("-21 dB")");
  EXPECT_EQ(shownEnergy({1, 60000, 60000}), R"("0 dB")");
}

TEST_F(ActiveSetTest, ThreeEnergiesOfZeroShow0Db) {
  EXPECT_EQ(shownEnergy({0, 0, 0}), R"("0 dB")");
  EXPECT_EQ(shown("RSCP"), R"("-55 dB")");
}

TEST_F(ActiveSetTest, EnergiesAreUnsignedAndHave32Bits) {
  EXPECT_EQ(shownEnergy({0xFFFFFFFF, 0, 0}), R"("0 dB")");
  EXPECT_EQ(shownEnergy({0x80000000, 60000, 0}), R"("0 dB")");
  EXPECT_EQ(shownEnergy({0x00010000, 0, 0}), R"("-10 dB")");
  EXPECT_EQ(shownEnergy({0x01000000, 0, 0}), R"("0 dB")");
}

TEST_F(ActiveSetTest, EnergiesGoThroughTheTableOfDecibels) {
  EXPECT_EQ(shownEnergy({705, 0, 0}), R"("0 dB")");
  EXPECT_EQ(shownEnergy({706, 0, 0}), R"("-31 dB")");
  EXPECT_EQ(shownEnergy({814, 0, 0}), R"("-30 dB")");
  EXPECT_EQ(shownEnergy({524287, 0, 0}), R"("-1 dB")");
  EXPECT_EQ(shownEnergy({524288, 0, 0}), R"("0 dB")");
}

TEST_F(ActiveSetTest, TheScramblingCodeHas13Bits) {
  decodeCells(0, {{0x1FFF, {}}});
  EXPECT_EQ(shown("Scrambling Code"), R"("8191")");
  for (unsigned bit = 0; bit < 13; ++bit) {
    decodeCells(0, {{static_cast<std::uint16_t>(1u << bit), {}}});
    EXPECT_EQ(shown("Scrambling Code"), quoted(unsignedWordBits[bit])) << bit;
  }
}

TEST_F(ActiveSetTest, ACellWithAnyOfTheTopThreeBitsSetIsLeftOut) {
  for (unsigned set = 1; set < 8; ++set) {
    putOldContent();
    decodeCells(0, {{static_cast<std::uint16_t>(set << 13 | 7), {}}});
    EXPECT_EQ(shown(), "[]") << set;
  }
}

TEST_F(ActiveSetTest, EachCellHasTheEnergiesOfItsOwnPlaceThoughCellsBeforeItAreLeftOut) {
  decodeCells(-512, {{0x2001, {706, 0, 0}},
                     {0x0002, {60000, 0, 0}},
                     {0x8003, {814, 0, 0}},
                     {0x0004, {0, 5000, 0}},
                     {0xE005, {706, 0, 0}}});
  EXPECT_EQ(shown(), "[" + row(2, -116, -10) + ", " + row(4, -127, -21) + "]");
}

TEST_F(ActiveSetTest, NoOtherByteOfAPacketIsShown) {
  const Bytes packet = twoCells();
  decode(packet);
  const std::string expected = shown();
  for (std::size_t offset = 0; offset < packet.size(); ++offset) {
    const bool isShown = (offset >= 13 && offset <= 15) || offset == 23 || offset == 24 || offset == 38 ||
                         offset == 39 || (offset >= 78 && offset < 90) || (offset >= 122 && offset < 134);
    if (isShown) continue;
    Bytes changed = packet;
    changed[offset] = 0x11;
    decode(changed);
    EXPECT_EQ(shown(), expected) << "byte " << offset;
  }
}

TEST_F(ActiveSetTest, EachPacketReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(twoCells());
  EXPECT_EQ(rowCount(), 2u);
  decodeCells(-512, {{9, {}}});
  EXPECT_EQ(shown(), "[" + row(9, -106, 0) + "]");
}

TEST_F(ActiveSetTest, ACountOf0EmptiesTheListSilently) {
  putOldContent();
  decodeCells(-200, {});
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ActiveSetTest, TwoHundredFiftyFiveCellsAreAllShown) {
  std::vector<MeasuredCell> cells(255);
  cells.front() = {1, {60000, 0, 0}};
  cells.back() = {511, {0, 0, 5000}};
  decodeCells(-512, cells);
  ASSERT_EQ(rowCount(), 255u);
  EXPECT_EQ(described(section.array()->front()), row(1, -116, -10));
  EXPECT_EQ(described(section.array()->back()), row(511, -127, -21));
}

TEST_F(ActiveSetTest, PacketsOf16And17BytesAreAccepted) {
  for (const std::size_t size : {16u, 17u}) {
    putOldContent();
    decode(PacketBuilder(cellSetCode, size).bytes());
    EXPECT_EQ(shown(), "[]") << size;
  }
}

TEST_F(ActiveSetTest, CellsBeyondThePacketShowZeros) {
  putOldContent();
  decode(PacketBuilder(cellSetCode, 16).u16(13, 0xFE00).u8(15, 255).bytes());
  ASSERT_EQ(rowCount(), 255u);
  for (const Value& cell : *section.array()) EXPECT_EQ(described(cell), row(0, -106, 0));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ActiveSetTest, ACellCutBeforeItsSetMembershipIsShown) {
  Bytes packet = cellSetPacket(-512, {{0xE034, {}}}).bytes();
  packet.resize(24);
  decode(packet);
  EXPECT_EQ(shown(), "[" + row(0x34, -106, 0) + "]");
}

TEST_F(ActiveSetTest, EveryTruncatedPacketShowsBothCellsWithZerosForWhatIsCutOff) {
  forEachTruncation(twoCells(), [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string first = row(0, -75, 0);
    if (size == 24) first = row(0x34, -75, 0);
    if (size > 24) first = row(4660, -75, 0);
    if (size >= 80) first = row(4660, -85, -10);
    std::string second = row(0, -75, 0);
    if (size == 39) second = row(2, -75, 0);
    if (size > 39) second = row(258, -75, 0);
    if (size >= 132) second = row(258, -96, -21);
    EXPECT_EQ(shown(), size < 16 ? oldContent() : "[" + first + ", " + second + "]");
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

}  // namespace
}  // namespace varnel
