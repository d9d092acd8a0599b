#include "terminal/CellGrid.h"

#include <algorithm>

#include "terminal/Characters.h"

namespace varnel {

namespace {

// Of the characters that change another one, a cell takes so many.
constexpr std::size_t longestCell = 5;

}  // namespace

CellGrid::CellGrid(int columns, int rows)
    : _columns(std::max(1, columns)),
      _rows(std::max(1, rows)),
      _cells(static_cast<std::size_t>(_columns) * static_cast<std::size_t>(_rows)) {}

void CellGrid::write(int column, int row, std::wstring_view text, const Look& look, const Area& inside) {
  if (row < 0 || row >= _rows || !inside.contains(inside.column, row)) return;
  for (const wchar_t character : text) {
    const int width = columnsOf(character);
    if (width == 0) {
      const int before = column - 1;
      if (before < inside.column || before >= inside.column + inside.columns || !area().contains(before, row))
        continue;
      GridCell* base = &_cells[index(before, row)];
      if (base->text.empty() && before > 0) --base;
      if (base->text.size() < longestCell) base->text.push_back(character);
      continue;
    }
    put(column, row, character, width, look, inside);
    column += width;
  }
}

void CellGrid::put(int column, int row, wchar_t character, int width, const Look& look, const Area& inside) {
  const auto isInside = [&](int at) { return inside.contains(at, row) && area().contains(at, row); };
  const bool isWhole = isInside(column) && isInside(column + width - 1);
  for (int at = column; at < column + width; ++at) {
    if (!isInside(at)) continue;
    breakWideCharacterAt(at, row);
    std::wstring text(1, L' ');
    if (isWhole) text = at == column ? std::wstring(1, character) : std::wstring();
    _cells[index(at, row)] = {std::move(text), look};
  }
}

// The other half of a wide character must not stay when one half is written over.
void CellGrid::breakWideCharacterAt(int column, int row) {
  GridCell& cell = _cells[index(column, row)];
  if (cell.text.empty() && column > 0) _cells[index(column - 1, row)].text = L" ";
  if (column + 1 < _columns && _cells[index(column + 1, row)].text.empty())
    _cells[index(column + 1, row)].text = L" ";
  cell.text = L" ";
}

void CellGrid::fill(const Area& wanted, const Look& look) {
  for (int row = wanted.row; row < wanted.row + wanted.rows; ++row)
    write(wanted.column, row, std::wstring(static_cast<std::size_t>(std::max(0, wanted.columns)), L' '),
          look);
}

void CellGrid::setLook(const Area& wanted, const Look& look) {
  for (int row = wanted.row; row < wanted.row + wanted.rows; ++row) {
    for (int column = wanted.column; column < wanted.column + wanted.columns; ++column) {
      if (area().contains(column, row)) _cells[index(column, row)].look = look;
    }
  }
}

void CellGrid::copyRow(int row, const CellGrid& other, int otherRow) {
  for (int column = 0; column < _columns; ++column)
    _cells[index(column, row)] = other._cells[other.index(column, otherRow)];
  if (other._cursorRow == otherRow) setCursor(other._cursorColumn, row);
}

void CellGrid::setCursor(int column, int row) {
  _cursorColumn = std::clamp(column, 0, _columns - 1);
  _cursorRow = std::clamp(row, 0, _rows - 1);
}

std::string CellGrid::line(int row) const {
  std::wstring text;
  for (int column = 0; column < _columns; ++column) text += at(column, row).text;
  text.erase(text.find_last_not_of(L' ') + 1);
  return utf8(text);
}

std::string CellGrid::text() const {
  std::string lines;
  for (int row = 0; row < _rows; ++row) lines += line(row) + '\n';
  return lines;
}

}  // namespace varnel
