#include "terminal/AlertBox.h"

#include <algorithm>

#include "terminal/Characters.h"

namespace varnel {

namespace {

constexpr int widestText = 50;

}  // namespace

Overlay::Wish AlertBox::take(const Key& key) {
  const bool isAnswer = key.kind == Key::Kind::Enter || key.kind == Key::Kind::Escape ||
                        key.kind == Key::Kind::Click || key.is(L' ');
  return isAnswer ? Wish::Close : Wish::Stay;
}

void AlertBox::paint(CellGrid& grid, const Glyphs& glyphs) {
  std::vector<std::wstring> lines{charactersOf(_alert.title)};
  for (auto& line : wrapped(_alert.message, std::min(widestText, grid.columns() - 4))) lines.push_back(line);
  const std::wstring button = L"[ " + charactersOf(_alert.buttonTitle) + L" ]";
  lines.push_back(button);
  int widest = 0;
  for (const std::wstring& line : lines) widest = std::max(widest, columnsOf(line));
  const int columns = std::min(grid.columns(), widest + 4);
  const int rows = std::min(grid.rows(), static_cast<int>(lines.size()) + 2);
  const Area box{(grid.columns() - columns) / 2, (grid.rows() - rows) / 2, columns, rows};
  grid.fill(box);
  for (int column = box.column; column < box.column + box.columns; ++column) {
    grid.write(column, box.row, glyphs.line);
    grid.write(column, box.row + box.rows - 1, glyphs.line);
  }
  for (std::size_t i = 0; i < lines.size(); ++i) {
    Look look;
    look.isBold = i == 0;
    look.isReversed = i + 1 == lines.size();
    const bool isLast = i + 1 == lines.size();
    // On the smallest screen the button is what has to be seen.
    const int row = isLast ? box.row + box.rows - 2 : box.row + 1 + static_cast<int>(i);
    if (!isLast && row >= box.row + box.rows - 2) continue;
    grid.write(box.column + (box.columns - columnsOf(lines[i])) / 2, row, lines[i], look, box);
  }
}

}  // namespace varnel
