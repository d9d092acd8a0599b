#include "app/VarnelCell.h"

#include <gtest/gtest.h>

#include "tests/support/RecordingTable.h"

namespace varnel {

namespace {

// The content area is 300 by 50. Bold letters are 10 by 20, regular ones 7 by 16.
class VarnelCellTest : public testing::Test {
 protected:
  std::unique_ptr<VarnelCell> nameOnly() {
    return VarnelCell::initWithStyleKey_reuseIdentifier(table, metrics, CellStyle::NameAndDetail, "Row");
  }
  std::unique_ptr<VarnelCell> nameAndValue(std::string_view key, std::string_view value) {
    auto cell = VarnelCell::initWithStyle_reuseIdentifier(table, metrics, CellStyle::NameAndDetail, "Row");
    cell->key().setText(key);
    cell->value()->setText(value);
    return cell;
  }
  static const RecordingCellView& view(const VarnelCell& cell) {
    return static_cast<const RecordingCellView&>(cell.cellView());
  }
  static const RecordingLabel& label(const Label& label) { return static_cast<const RecordingLabel&>(label); }
  static const RecordingScrollContainer& container(const VarnelCell& cell) {
    return *view(cell).containers.at(0);
  }

  RecordingTable table;
  LetterMetrics metrics;
};

TEST_F(VarnelCellTest, ANameOnlyCellHasItsKeyInTheCellItself) {
  const auto cell = nameOnly();
  ASSERT_EQ(view(*cell).labels.size(), 1u);
  EXPECT_EQ(view(*cell).labels[0].get(), &cell->key());
  EXPECT_TRUE(view(*cell).containers.empty());
  EXPECT_EQ(cell->value(), nullptr);
}

TEST_F(VarnelCellTest, ANameAndValueCellHasBothInAScrollContainer) {
  const auto cell = nameAndValue("RSSI", "-71 dBm");
  EXPECT_TRUE(view(*cell).labels.empty());
  ASSERT_EQ(view(*cell).containers.size(), 1u);
  ASSERT_EQ(container(*cell).labels.size(), 2u);
  EXPECT_EQ(container(*cell).labels[0].get(), &cell->key());
  EXPECT_EQ(container(*cell).labels[1].get(), cell->value());
}

TEST_F(VarnelCellTest, TheKeyIsBoldAndTheValueRegularOfSize15) {
  EXPECT_EQ(label(nameOnly()->key()).font, Font::boldSystem(15));
  const auto cell = nameAndValue("RSSI", "-71 dBm");
  EXPECT_EQ(label(cell->key()).font, Font::boldSystem(15));
  EXPECT_EQ(label(*cell->value()).font, Font::system(15));
}

TEST_F(VarnelCellTest, HasItsStyleAndReuseIdentifier) {
  const auto cell = nameOnly();
  EXPECT_EQ(view(*cell).style, CellStyle::NameAndDetail);
  EXPECT_EQ(cell->reuseIdentifier(), "Row");
  EXPECT_EQ(nameAndValue("a", "b")->reuseIdentifier(), "Row");
}

TEST_F(VarnelCellTest, ANameAloneStands10FromTheLeftInTheMiddle) {
  const auto cell = nameOnly();
  cell->key().setText("Cells");
  cell->setLayoutKey();
  EXPECT_EQ(label(cell->key()).frame, (Rect{10, 15, 50, 20}));
}

TEST_F(VarnelCellTest, TheCellIsLaidOutByItsHostFirst) {
  const auto cell = nameOnly();
  cell->setLayoutKey();
  EXPECT_EQ(view(*cell).layouts, 1u);
  cell->setLayout();
  EXPECT_EQ(view(*cell).layouts, 2u);
}

TEST_F(VarnelCellTest, AShortValueStandsAtTheRightEdge) {
  const auto cell = nameAndValue("RSSI", "-71 dBm");  // needs 40 + 10 + 50 + 70
  cell->setLayout();
  EXPECT_EQ(label(cell->key()).frame, (Rect{10, 15, 40, 20}));
  EXPECT_EQ(label(*cell->value()).frame, (Rect{230, 15, 70, 20}));
  EXPECT_EQ(container(*cell).contentSize, (Size{300, 50}));
  EXPECT_EQ(container(*cell).frame, (Rect{0, 0, 300, 50}));
}

TEST_F(VarnelCellTest, AValueThatJustLeavesRoomStandsAtTheRightEdge) {
  const auto cell = nameAndValue("RSSI", "nineteen letters ..");  // needs 290
  cell->setLayout();
  EXPECT_EQ(label(*cell->value()).frame, (Rect{110, 15, 190, 20}));
  EXPECT_EQ(container(*cell).contentSize, (Size{300, 50}));
}

TEST_F(VarnelCellTest, AValueThatFitsExactlyStands50BehindTheName) {
  const auto cell = nameAndValue("RSSI", "exactly 20 letters .");  // needs 300
  cell->setLayout();
  EXPECT_EQ(label(*cell->value()).frame, (Rect{100, 15, 200, 20}));
  EXPECT_EQ(container(*cell).contentSize, (Size{300, 50}));
  EXPECT_EQ(container(*cell).frame, (Rect{0, 0, 300, 50}));
}

TEST_F(VarnelCellTest, AWiderValueStands50BehindTheNameAndTheRowScrolls) {
  const auto cell = nameAndValue("RSSI", "just over, 21 letters");  // needs 310
  cell->setLayout();
  EXPECT_EQ(label(cell->key()).frame, (Rect{10, 15, 40, 20}));
  EXPECT_EQ(label(*cell->value()).frame, (Rect{100, 15, 210, 20}));
  EXPECT_EQ(container(*cell).contentSize, (Size{550, 50}));
  EXPECT_EQ(container(*cell).frame, (Rect{0, 0, 300, 50}));
}

TEST_F(VarnelCellTest, TheValueIsMeasuredInBoldThoughItIsDrawnInRegular) {
  const auto cell = nameAndValue("A", "12345678");
  cell->setLayout();
  // In the regular font it would be 56 by 16.
  EXPECT_EQ(label(*cell->value()).frame, (Rect{220, 15, 80, 20}));
}

TEST_F(VarnelCellTest, FramesFollowTheContentAreasBounds) {
  table.content = {4, 3, 300, 44};
  const auto name = nameOnly();
  name->key().setText("Cells");
  name->setLayoutKey();
  EXPECT_EQ(label(name->key()).frame, (Rect{14, 12, 50, 20}));

  const auto near = nameAndValue("RSSI", "-71 dBm");
  near->setLayout();
  EXPECT_EQ(label(near->key()).frame, (Rect{14, 12, 40, 20}));
  EXPECT_EQ(label(*near->value()).frame, (Rect{230, 12, 70, 20})) << "flush with the width alone";
  EXPECT_EQ(container(*near).contentSize, (Size{300, 50}));
  EXPECT_EQ(container(*near).frame, (Rect{4, 3, 300, 50})) << "50 high whatever the area";
}

TEST_F(VarnelCellTest, AValueThatFitsExactlyIsNotFlushRightWhereverTheAreaBegins) {
  table.content = {4, 3, 300, 44};
  const auto cell = nameAndValue("RSSI", "exactly 20 letters .");  // needs 300
  cell->setLayout();
  EXPECT_EQ(label(*cell->value()).frame, (Rect{104, 12, 200, 20}));
  EXPECT_EQ(container(*cell).contentSize, (Size{300, 50}));
}

TEST_F(VarnelCellTest, EmptyTextsHaveNoWidth) {
  const auto cell = nameAndValue("", "");
  cell->setLayout();
  EXPECT_EQ(label(cell->key()).frame, (Rect{10, 15, 0, 20}));
  EXPECT_EQ(label(*cell->value()).frame, (Rect{300, 15, 0, 20}));
}

TEST_F(VarnelCellTest, ANameOnlyCellLaidOutForALeafPlacesItsName) {
  const auto cell = nameOnly();
  cell->key().setText("RSSI");
  cell->setLayout();
  EXPECT_EQ(label(cell->key()).frame, (Rect{10, 15, 40, 20}));
}

TEST_F(VarnelCellTest, ALeafCellLaidOutForAnInnerNodeKeepsItsContainer) {
  const auto cell = nameAndValue("RSSI", "just over, 21 letters");
  cell->setLayout();
  cell->key().setText("Cells");
  cell->value()->setText("");
  cell->setLayoutKey();
  EXPECT_EQ(label(cell->key()).frame, (Rect{10, 15, 50, 20}));
  EXPECT_EQ(label(*cell->value()).frame, (Rect{100, 15, 210, 20}));
  EXPECT_EQ(container(*cell).contentSize, (Size{550, 50}));
}

TEST_F(VarnelCellTest, AnotherWidthRepeatsTheLastLayout) {
  const auto leaf = nameAndValue("RSSI", "-71 dBm");
  leaf->layOutAgain();
  EXPECT_EQ(view(*leaf).layouts, 0u) << "there was none";
  leaf->setLayout();
  table.content.width = 400;
  leaf->layOutAgain();
  EXPECT_EQ(label(*leaf->value()).frame, (Rect{330, 15, 70, 20}));
  EXPECT_EQ(container(*leaf).frame, (Rect{0, 0, 400, 50}));
  leaf->setLayoutKey();
  table.content.width = 500;
  leaf->layOutAgain();
  EXPECT_EQ(label(*leaf->value()).frame, (Rect{330, 15, 70, 20}));
}

}  // namespace
}  // namespace varnel
