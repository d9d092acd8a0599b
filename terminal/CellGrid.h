#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace varnel {

/// What a text is, where a color may say so. No meaning is in the color alone.
enum class Ink {
  Plain,
  Mark,    ///< what stands for something, such as the mark of a row that leads to another pane
  Change,  ///< what changed with the last refresh
  Notice,
};

/// How characters look.
struct Look {
  bool isBold = false;
  bool isReversed = false;
  Ink ink = Ink::Plain;

  friend bool operator==(const Look&, const Look&) = default;
};

/// What stands in one column of one row: a character with those that change it.
struct GridCell {
  std::wstring text = L" ";  ///< empty in the second column of a wide character
  Look look{};

  friend bool operator==(const GridCell&, const GridCell&) = default;
};

/// A rectangle of columns and rows.
struct Area {
  int column = 0;
  int row = 0;
  int columns = 0;
  int rows = 0;

  bool contains(int atColumn, int atRow) const {
    return atColumn >= column && atColumn < column + columns && atRow >= row && atRow < row + rows;
  }
  friend bool operator==(const Area&, const Area&) = default;
};

/// A terminal's screen as the program wants it. Everything is painted here first.
class CellGrid {
 public:
  CellGrid(int columns, int rows);

  int columns() const { return _columns; }
  int rows() const { return _rows; }
  Area area() const { return {0, 0, _columns, _rows}; }
  const GridCell& at(int column, int row) const { return _cells[index(column, row)]; }

  /// Writes the text on one row, from this column on, as far as it lies inside the area. Half of a wide
  /// character at an edge becomes a blank. The column may be negative.
  void write(int column, int row, std::wstring_view text, const Look& look, const Area& inside);
  /// The same, in the whole grid.
  void write(int column, int row, std::wstring_view text, const Look& look = {}) {
    write(column, row, text, look, area());
  }
  /// Blanks with this look.
  void fill(const Area& area, const Look& look = {});
  /// Changes the look of what stands in the area.
  void setLook(const Area& area, const Look& look);
  /// Copies a row of another grid of the same width, and the cursor if it is there.
  void copyRow(int row, const CellGrid& other, int otherRow);
  /// Where the user's typing goes; no cursor is shown unless this is called.
  void setCursor(int column, int row);
  void hideCursor() { _cursorColumn = _cursorRow = -1; }
  bool hasCursor() const { return _cursorRow >= 0; }
  int cursorColumn() const { return _cursorColumn; }
  int cursorRow() const { return _cursorRow; }

  /// The row as text without the blanks at its end.
  std::string line(int row) const;
  /// All rows, each with a newline.
  std::string text() const;

 private:
  std::size_t index(int column, int row) const {
    return static_cast<std::size_t>(row) * static_cast<std::size_t>(_columns) +
           static_cast<std::size_t>(column);
  }
  void put(int column, int row, wchar_t character, int width, const Look& look, const Area& inside);
  void breakWideCharacterAt(int column, int row);

  int _columns;
  int _rows;
  int _cursorColumn = -1;
  int _cursorRow = -1;
  std::vector<GridCell> _cells;
};

}  // namespace varnel
