#include "terminal/TerminalTable.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "terminal/TerminalMetrics.h"

namespace varnel {
namespace {

// Rows that have only a name.
class Names final : public TableViewDelegate {
 public:
  explicit Names(std::vector<std::string> names) : names(std::move(names)) {}
  std::size_t tableView_numberOfRowsInSection(TableView&, std::size_t) override { return names.size(); }
  std::unique_ptr<TableCell> tableView_cellForRowAtIndexPath(TableView& table,
                                                             const IndexPath& path) override {
    auto cell = table.dequeueReusableCell("name");
    if (!cell) {
      ++cellsMade;
      cell = std::make_unique<TableCell>(table.makeCellView(CellStyle::Default), "name");
    }
    cell->cellView().layOut();
    cell->cellView().setText(names[path.row]);
    return cell;
  }
  void tableView_didSelectRowAtIndexPath(TableView&, const std::optional<IndexPath>& path) override {
    chosen.push_back(names[path->row]);
  }

  std::vector<std::string> names;
  std::vector<std::string> chosen;
  unsigned cellsMade = 0;
};

class TerminalTableTest : public testing::Test {
 protected:
  TerminalTableTest() {
    table.setDelegate(&rows);
    table.setArea({0, 0, 8, 3});
  }
  // A blank, the names of the visible rows, and the row with the focus in brackets.
  std::string shown() const {
    CellGrid grid(8, 3);
    table.paint(grid, TerminalRow::Emphasis::Focus, unicodeGlyphs);
    std::string text;
    for (int row = 0; row < 3; ++row) {
      const std::string line = grid.line(row);
      const bool hasFocus = grid.at(0, row).look.isReversed;
      text += hasFocus ? "[" + line + " ]" : line;
    }
    return text;
  }
  void press(Key::Kind kind) { table.take({kind}); }
  void type(const std::wstring& letters) {
    for (const wchar_t letter : letters) table.take(Key::of(letter));
  }

  Names rows{{"a", "b", "c", "d", "e"}};
  TerminalTable table;
};

TEST_F(TerminalTableTest, ShowsAsManyRowsAsThereIsRoomFor) { EXPECT_EQ(shown(), "[ a ] b c"); }

TEST_F(TerminalTableTest, ArrowsAndTheirLettersGoFromRowToRow) {
  press(Key::Kind::Down);
  EXPECT_EQ(shown(), " a[ b ] c");
  type(L"jj");
  EXPECT_EQ(shown(), " b c[ d ]");
  press(Key::Kind::Up);
  type(L"k");
  EXPECT_EQ(shown(), "[ b ] c d");
}

TEST_F(TerminalTableTest, TheFocusStopsAtBothEnds) {
  press(Key::Kind::Up);
  EXPECT_EQ(shown(), "[ a ] b c");
  type(L"G");
  press(Key::Kind::Down);
  EXPECT_EQ(shown(), " c d[ e ]");
  type(L"g");
  EXPECT_EQ(shown(), "[ a ] b c");
}

TEST_F(TerminalTableTest, APageIsAsLongAsTheTable) {
  press(Key::Kind::PageDown);
  EXPECT_EQ(shown(), " c[ d ] e");
  press(Key::Kind::PageUp);
  EXPECT_EQ(shown(), "[ a ] b c");
}

TEST_F(TerminalTableTest, ReturnRightLAndSpaceChooseTheRow) {
  press(Key::Kind::Down);
  press(Key::Kind::Enter);
  press(Key::Kind::Right);
  type(L"l ");
  EXPECT_EQ(rows.chosen, (std::vector<std::string>{"b", "b", "b", "b"}));
}

TEST_F(TerminalTableTest, AClickChoosesTheRowBelowTheMouse) {
  table.take({Key::Kind::Click, 0, 2, 1});
  EXPECT_EQ(rows.chosen, std::vector<std::string>{"b"});
  EXPECT_EQ(shown(), " a[ b ] c");
  EXPECT_EQ(table.take({Key::Kind::Click, 0, 2, 7}), KeyUse::Unused);
}

TEST_F(TerminalTableTest, TheWheelScrollsAndTheFocusStaysVisible) {
  table.take({Key::Kind::WheelDown, 0, 0, 0});
  EXPECT_EQ(shown(), "[ c ] d e");
  table.take({Key::Kind::WheelUp, 0, 0, 0});
  EXPECT_EQ(shown(), " a b[ c ]");
}

TEST_F(TerminalTableTest, AReloadGivesEachRowItsOwnCellBack) {
  EXPECT_EQ(rows.cellsMade, 3u);
  table.reloadData();
  EXPECT_EQ(rows.cellsMade, 3u);
}

TEST_F(TerminalTableTest, OtherRowsGetNoOldCell) {
  rows.names = {"a", "x", "c", "d", "e"};
  table.reloadData();
  EXPECT_EQ(rows.cellsMade, 6u);
}

TEST_F(TerminalTableTest, TheFocusFollowsItsRow) {
  type(L"jj");
  rows.names = {"new", "a", "b", "c", "d", "e"};
  table.reloadData();
  EXPECT_EQ(table.focus(), 2u) << "the row has left the screen";
  rows.names.erase(rows.names.begin());
  table.reloadData();
  EXPECT_EQ(table.focus(), 1u) << "row b had the focus";
}

TEST_F(TerminalTableTest, TheFocusStaysWithinFewerRows) {
  type(L"G");
  rows.names = {"a", "b"};
  table.reloadData();
  EXPECT_EQ(shown(), " a[ b ]");
  rows.names.clear();
  table.reloadData();
  EXPECT_EQ(table.focus(), std::nullopt);
  EXPECT_EQ(shown(), "");
  for (const Key::Kind kind : {Key::Kind::Down, Key::Kind::PageDown, Key::Kind::End, Key::Kind::Enter})
    press(kind);
  EXPECT_TRUE(rows.chosen.empty());
}

TEST_F(TerminalTableTest, ASelectedRowIsScrolledTo) {
  table.selectRow({0, 4});
  EXPECT_EQ(shown(), " c d[ e ]");
  table.selectRow({0, 5});
  EXPECT_EQ(table.focus(), 4u) << "there is no such row";
}

TEST_F(TerminalTableTest, ASmallerTableKeepsTheFocusVisible) {
  type(L"jj");
  table.setArea({0, 0, 8, 1});
  EXPECT_EQ(shown(), "[ c ]");
  table.setArea({0, 0, 8, 0});
  EXPECT_EQ(shown(), "");
  table.setArea({0, 0, 8, 3});
  EXPECT_EQ(table.focus(), 2u);
}

TEST_F(TerminalTableTest, TellsThePlaceWhileNotAllRowsAreVisible) {
  EXPECT_EQ(table.position(), L"1/5");
  table.setArea({0, 0, 8, 5});
  EXPECT_EQ(table.position(), L"");
}

TEST_F(TerminalTableTest, ATableThatFellSilentTellsNobody) {
  table.fallSilent();
  press(Key::Kind::Enter);
  table.reloadData();
  EXPECT_TRUE(rows.chosen.empty());
}

}  // namespace
}  // namespace varnel
