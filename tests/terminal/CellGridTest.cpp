#include "terminal/CellGrid.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

TEST(CellGrid, HoldsWhatIsWritten) {
  CellGrid grid(5, 2);
  grid.write(1, 0, L"abc");
  EXPECT_EQ(grid.text(), " abc\n\n");
}

TEST(CellGrid, NothingIsWrittenPastTheEdges) {
  CellGrid grid(3, 1);
  grid.write(-1, 0, L"abcdef");
  grid.write(0, 1, L"x");
  grid.write(0, -1, L"x");
  EXPECT_EQ(grid.text(), "bcd\n");
}

TEST(CellGrid, NothingIsWrittenOutsideTheArea) {
  CellGrid grid(6, 1);
  grid.write(0, 0, L"abcdef", {}, {2, 0, 2, 1});
  EXPECT_EQ(grid.text(), "  cd\n");
}

TEST(CellGrid, HalfOfAWideCharacterIsABlank) {
  CellGrid grid(3, 1);
  grid.write(0, 0, L"中国");
  EXPECT_EQ(grid.text(), "中\n");
  EXPECT_EQ(grid.at(1, 0).text, L"");
  EXPECT_EQ(grid.at(2, 0).text, L" ");
  grid.write(-1, 0, L"中x");
  EXPECT_EQ(grid.text(), " x\n") << "also at the left edge";
}

TEST(CellGrid, WritingOverHalfOfAWideCharacterRemovesTheOtherHalf) {
  CellGrid grid(4, 1);
  grid.write(0, 0, L"中国");
  grid.write(1, 0, L"x");
  EXPECT_EQ(grid.text(), " x国\n");
  grid.write(2, 0, L"y");
  EXPECT_EQ(grid.text(), " xy\n");
}

TEST(CellGrid, AnAccentBelongsToTheCharacterBefore) {
  CellGrid grid(3, 1);
  grid.write(0, 0, L"e\x0301x");
  EXPECT_EQ(grid.at(0, 0).text, L"e\x0301");
  EXPECT_EQ(grid.at(1, 0).text, L"x");
}

TEST(CellGrid, AnEndlessRowOfAccentsIsCut) {
  CellGrid grid(3, 1);
  grid.write(0, 0, L"e" + std::wstring(100, L'\x0301'));
  EXPECT_EQ(grid.at(0, 0).text.size(), 5u);
}

TEST(CellGrid, AScreenHasAtLeastOneCell) {
  const CellGrid grid(0, -3);
  EXPECT_EQ(grid.columns(), 1);
  EXPECT_EQ(grid.rows(), 1);
}

TEST(CellGrid, TheCursorStaysOnTheScreen) {
  CellGrid grid(3, 2);
  EXPECT_FALSE(grid.hasCursor());
  grid.setCursor(9, 9);
  EXPECT_TRUE(grid.hasCursor());
  EXPECT_EQ(grid.cursorColumn(), 2);
  EXPECT_EQ(grid.cursorRow(), 1);
}

}  // namespace
}  // namespace varnel
