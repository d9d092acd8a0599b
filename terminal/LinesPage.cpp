#include "terminal/LinesPage.h"

#include <algorithm>
#include <utility>

#include "terminal/Characters.h"

namespace varnel {

namespace {

constexpr int wheelStep = 3;
constexpr int wholeText = 1 << 20;
constexpr std::wstring_view wayBack = L" q Back ";

}  // namespace

LinesPage::LinesPage(std::wstring title, std::function<std::string()> text, Start start)
    : _title(std::move(title)), _text(std::move(text)), _isAtEnd(start == Start::End) {}

void LinesPage::scrollBy(int lines) {
  _top = std::clamp(_top + lines, 0, _lastTop);
  _isAtEnd = _isAtEnd ? _top == _lastTop : false;
  if (lines > 0 && _top == _lastTop) _isAtEnd = true;
}

Overlay::Wish LinesPage::take(const Key& key) {
  switch (key.kind) {
    case Key::Kind::Escape:
    case Key::Kind::Left:
    case Key::Kind::Backspace:
    case Key::Kind::Help:
    case Key::Kind::Enter:
      return Wish::Close;
    case Key::Kind::Up:
      scrollBy(-1);
      return Wish::Stay;
    case Key::Kind::Down:
      scrollBy(1);
      return Wish::Stay;
    case Key::Kind::PageUp:
      scrollBy(-_page);
      return Wish::Stay;
    case Key::Kind::PageDown:
      scrollBy(_page);
      return Wish::Stay;
    case Key::Kind::Home:
      scrollBy(-wholeText);
      return Wish::Stay;
    case Key::Kind::End:
      scrollBy(wholeText);
      return Wish::Stay;
    case Key::Kind::WheelUp:
      scrollBy(-wheelStep);
      return Wish::Stay;
    case Key::Kind::WheelDown:
      scrollBy(wheelStep);
      return Wish::Stay;
    default:
      break;
  }
  if (key.is(L'q') || key.is(L'h') || key.is(L'?') || key.is(L'L')) return Wish::Close;
  if (key.is(L'j')) scrollBy(1);
  if (key.is(L'k')) scrollBy(-1);
  if (key.is(L' ')) scrollBy(_page);
  if (key.is(L'g')) scrollBy(-wholeText);
  if (key.is(L'G')) scrollBy(wholeText);
  return Wish::Stay;
}

void LinesPage::paint(CellGrid& grid, const Glyphs& glyphs) {
  const Look bar{false, true, Ink::Plain};
  grid.fill(grid.area());
  grid.fill({0, 0, grid.columns(), 1}, bar);
  Look bold = bar;
  bold.isBold = true;
  grid.write(1, 0, cutTo(_title, grid.columns() - 2, glyphs.more), bold);
  const auto lines = wrapped(_text(), grid.columns() - 1);
  _page = std::max(1, grid.rows() - 2);
  _lastTop = std::max(0, static_cast<int>(lines.size()) - _page);
  _top = _isAtEnd ? _lastTop : std::min(_top, _lastTop);
  for (int row = 0; row < _page && _top + row < static_cast<int>(lines.size()); ++row)
    grid.write(0, row + 1, lines[static_cast<std::size_t>(_top + row)]);
  grid.fill({0, grid.rows() - 1, grid.columns(), 1}, bar);
  if (_lastTop > 0) {
    const std::wstring place = L" " + std::to_wstring(_top + 1) + L"/" + std::to_wstring(lines.size());
    grid.write(0, grid.rows() - 1, cutTo(place, grid.columns() - columnsOf(wayBack), glyphs.more), bar);
  }
  grid.write(grid.columns() - columnsOf(wayBack), grid.rows() - 1, wayBack, bar);
}

}  // namespace varnel
