#include "terminal/FindPage.h"

#include <algorithm>
#include <utility>

#include "terminal/Characters.h"

namespace varnel {

namespace {

constexpr std::wstring_view label = L"Find:";
constexpr std::wstring_view keys = L" Enter Go there  Esc Leave ";
constexpr int wheelStep = 3;

}  // namespace

FindPage::FindPage(Search search, GoTo goTo) : _search(std::move(search)), _goTo(std::move(goTo)) {
  _rows = _search({});
}

void FindPage::moveBy(int rows) {
  _focus = std::clamp(_focus + rows, 0, std::max(0, static_cast<int>(_rows.size()) - 1));
}

// Rows come and go meanwhile. The focus stays on its row, and the row stays at its line.
void FindPage::searchAgain() {
  const auto former = std::exchange(_rows, _search(*_words.text()));
  if (_focus < static_cast<int>(former.size())) {
    const auto& path = former[static_cast<std::size_t>(_focus)].path;
    const auto found = std::ranges::find(_rows, path, &FoundRow::path);
    if (found != _rows.end()) {
      const int place = static_cast<int>(found - _rows.begin());
      _top = std::max(0, _top + place - _focus);
      _focus = place;
    }
  }
  moveBy(0);
}

Overlay::Wish FindPage::take(const Key& key) {
  switch (key.kind) {
    case Key::Kind::Escape:
      return Wish::Close;
    case Key::Kind::Up:
      moveBy(-1);
      return Wish::Stay;
    case Key::Kind::Down:
    case Key::Kind::Tab:
      moveBy(1);
      return Wish::Stay;
    case Key::Kind::PageUp:
      moveBy(-_page);
      return Wish::Stay;
    case Key::Kind::PageDown:
      moveBy(_page);
      return Wish::Stay;
    case Key::Kind::WheelUp:
      moveBy(-wheelStep);
      return Wish::Stay;
    case Key::Kind::WheelDown:
      moveBy(wheelStep);
      return Wish::Stay;
    case Key::Kind::Click: {
      const int row = _top + key.row - 1;
      if (key.row < 1 || key.row > _page || row >= static_cast<int>(_rows.size())) return Wish::Stay;
      _goTo(_rows[static_cast<std::size_t>(row)]);
      return Wish::Close;
    }
    case Key::Kind::Enter:
      if (_rows.empty()) return Wish::Stay;
      _goTo(_rows[static_cast<std::size_t>(_focus)]);
      return Wish::Close;
    default:
      if (_words.take(key) == KeyUse::Used) {
        _rows = _search(*_words.text());
        _focus = 0;
      }
      return Wish::Stay;
  }
}

void FindPage::paint(CellGrid& grid, const Glyphs& glyphs) {
  searchAgain();
  const Look bar{false, true, Ink::Plain};
  grid.fill(grid.area());
  grid.write(0, 0, label);
  const int field = columnsOf(label) + 1;
  _words.paint(grid, {field, 0, grid.columns() - field, 1}, TerminalTextField::Focus::Has);
  _page = std::max(1, grid.rows() - 2);
  _top = std::clamp(_top, std::max(0, _focus - _page + 1), _focus);
  for (int line = 0; line < _page && _top + line < static_cast<int>(_rows.size()); ++line) {
    Look look;
    look.isReversed = _top + line == _focus;
    paintRow(grid, line + 1, _rows[static_cast<std::size_t>(_top + line)], look, glyphs);
  }
  const int last = grid.rows() - 1;
  grid.fill({0, last, grid.columns(), 1}, bar);
  const std::wstring count = L" " + std::to_wstring(_rows.size()) + (_rows.size() == 1 ? L" row" : L" rows");
  grid.write(0, last, cutTo(count, grid.columns(), glyphs.more), bar);
  if (columnsOf(count) + columnsOf(keys) < grid.columns())
    grid.write(grid.columns() - columnsOf(keys), last, keys, bar);
}

// The names of the panes come first. Where they do not fit, their beginning is left out.
void FindPage::paintRow(CellGrid& grid, int line, const FoundRow& row, const Look& look,
                        const Glyphs& glyphs) const {
  const Area area{0, line, grid.columns(), 1};
  grid.fill(area, look);
  std::wstring names;
  for (std::size_t i = 0; i + 1 < row.path.size(); ++i)
    names.append(charactersOf(row.path[i])).append(glyphs.step);
  std::wstring own = row.path.empty() ? std::wstring() : charactersOf(row.path.back());
  const std::wstring value = cutTo(charactersOf(row.value), grid.columns() / 2, glyphs.more);
  const int room = grid.columns() - 2 - (value.empty() ? 0 : columnsOf(value) + 2);
  own = cutTo(own, room, glyphs.more);
  const int roomOfNames = room - columnsOf(own);
  if (columnsOf(names) > roomOfNames) {
    while (!names.empty() && columnsOf(names) > roomOfNames - columnsOf(glyphs.more)) names.erase(0, 1);
    names.insert(0, fitting(glyphs.more, roomOfNames));
  }
  Look bold = look;
  bold.isBold = true;
  grid.write(1, line, names, look);
  grid.write(1 + columnsOf(names), line, own, bold);
  grid.write(grid.columns() - 1 - columnsOf(value), line, value, look);
}

}  // namespace varnel
