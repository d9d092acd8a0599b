#pragma once

#include "tests/LogGenerator/KLV/GSMUMTS/CellSetPacket.h"
#include "tests/support/DecoderHarness.h"

namespace varnel {

/// The tests of a list section that UMTS cell set packets do nothing but empty. The subject has the `Decoder`
/// and its `trace` line.
template <class Subject>
class PlaceholderSetTest : public ListDecoderTest<typename Subject::Decoder, cellSetCode> {
 protected:
  /// Three cells, of them one of the active set.
  static Bytes threeCells() {
    return cellSetPacket(-200, {{0x2034, {60000, 0, 0}}, {0x0102, {0, 0, 5000}}, {0xE003, {}}}).bytes();
  }

  /// Expects a filled list to be emptied, with no line but the trace line.
  void expectEmptied(const Bytes& packet) {
    this->putOldContent();
    this->log.take();
    this->decode(packet);
    EXPECT_EQ(this->shown(), "[]") << packet.size() << " bytes";
    EXPECT_THAT(this->log.takeTexts(), testing::ElementsAre(Subject::trace)) << packet.size() << " bytes";
  }
};

TYPED_TEST_SUITE_P(PlaceholderSetTest);

TYPED_TEST_P(PlaceholderSetTest, ACountOf0EmptiesTheList) {
  this->expectEmptied(cellSetPacket(-200, {}).bytes());
}

TYPED_TEST_P(PlaceholderSetTest, CellsOfWhateverSetEmptyTheList) {
  this->expectEmptied(this->threeCells());
  for (unsigned set = 0; set < 8; ++set) {
    this->expectEmptied(cellSetPacket(0, {{static_cast<std::uint16_t>(set << 13), {}}}).bytes());
  }
}

TYPED_TEST_P(PlaceholderSetTest, TwoHundredFiftyFiveCellsEmptyTheList) {
  this->expectEmptied(cellSetPacket(0, std::vector<MeasuredCell>(255)).bytes());
}

TYPED_TEST_P(PlaceholderSetTest, CellsBeyondThePacketEmptyTheList) {
  this->expectEmptied(PacketBuilder(cellSetCode, 16).u8(15, 255).bytes());
}

TYPED_TEST_P(PlaceholderSetTest, PacketsOf16And17BytesEmptyTheList) {
  this->expectEmptied(PacketBuilder(cellSetCode, 16).bytes());
  this->expectEmptied(PacketBuilder(cellSetCode, 17).bytes());
}

TYPED_TEST_P(PlaceholderSetTest, EveryTruncatedPacketEmptiesTheListDownTo16Bytes) {
  this->forEachTruncation(this->threeCells(), [&](std::size_t size, const std::vector<std::string>& lines) {
    EXPECT_EQ(this->shown(), size < 16 ? this->oldContent() : "[]");
    EXPECT_THAT(lines, testing::ElementsAre(TypeParam::trace));
  });
}

REGISTER_TYPED_TEST_SUITE_P(PlaceholderSetTest, ACountOf0EmptiesTheList, CellsOfWhateverSetEmptyTheList,
                            TwoHundredFiftyFiveCellsEmptyTheList, CellsBeyondThePacketEmptyTheList,
                            PacketsOf16And17BytesEmptyTheList,
                            EveryTruncatedPacketEmptiesTheListDownTo16Bytes);

}  // namespace varnel
