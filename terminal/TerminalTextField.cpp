#include "terminal/TerminalTextField.h"

#include <algorithm>
#include <utility>

#include "terminal/Characters.h"

namespace varnel {

namespace {

// Nobody types more; a text that was pasted by mistake may be longer.
constexpr std::size_t longestText = 4096;

}  // namespace

TerminalTextField::TerminalTextField(std::string_view placeholder)
    : _placeholder(charactersOf(placeholder)) {}

std::optional<std::string> TerminalTextField::text() const { return utf8(_text); }

bool TerminalTextField::hasResigned() { return std::exchange(_hasResigned, false); }

void TerminalTextField::insert(wchar_t character) {
  if (_text.size() < longestText) _text.insert(_cursor++, 1, character);
}

KeyUse TerminalTextField::take(const Key& key) {
  switch (key.kind) {
    case Key::Kind::Character:
      insert(key.character);
      return KeyUse::Used;
    case Key::Kind::Left:
      if (_cursor > 0) --_cursor;
      return KeyUse::Used;
    case Key::Kind::Right:
      if (_cursor < _text.size()) ++_cursor;
      return KeyUse::Used;
    case Key::Kind::Home:
      _cursor = 0;
      return KeyUse::Used;
    case Key::Kind::End:
      _cursor = _text.size();
      return KeyUse::Used;
    case Key::Kind::Backspace:
      if (_cursor > 0) _text.erase(--_cursor, 1);
      return KeyUse::Used;
    case Key::Kind::Delete:
      _text.erase(_cursor, 1);
      return KeyUse::Used;
    case Key::Kind::Enter:
      if (_delegate) _delegate->textFieldShouldReturn(*this);
      return KeyUse::Used;
    case Key::Kind::Control:
      if (key.character != L'u') return KeyUse::Unused;
      _text.erase(0, std::exchange(_cursor, 0));
      return KeyUse::Used;
    default:
      return KeyUse::Unused;
  }
}

void TerminalTextField::paint(CellGrid& grid, const Area& area, Focus focus) const {
  if (area.columns < 3) return;
  grid.write(area.column, area.row, L"[", {}, area);
  grid.write(area.column + area.columns - 1, area.row, L"]", {}, area);
  const Area room{area.column + 1, area.row, area.columns - 2, 1};
  const int before = columnsOf(std::wstring_view(_text).substr(0, _cursor));
  const int scrolled = std::max(0, before - (room.columns - 1));
  if (_text.empty()) {
    Look faint;
    faint.ink = Ink::Mark;
    grid.write(room.column, room.row, _placeholder, faint, room);
  } else {
    grid.write(room.column - scrolled, room.row, _text, {}, room);
  }
  if (focus == Focus::Has) grid.setCursor(room.column + before - scrolled, room.row);
}

}  // namespace varnel
