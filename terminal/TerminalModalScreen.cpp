#include "terminal/TerminalModalScreen.h"

#include <algorithm>
#include <utility>

#include "terminal/Characters.h"
#include "terminal/TerminalMetrics.h"

namespace varnel {

namespace {

using Kind = ScreenElement::Kind;

}  // namespace

TerminalModalScreen::TerminalModalScreen(const ScreenLayout& layout, Actions actions)
    : _actions(std::move(actions)),
      _backgroundAction(layout.backgroundAction),
      _margin(wholeColumns(layout.margin)),
      _spacing(wholeColumns(layout.spacing)),
      _lines(layout.rows.size()) {
  for (std::size_t line = 0; line < layout.rows.size(); ++line) {
    for (const ScreenElement& described : layout.rows[line]) {
      Element& element = _elements.emplace_back(Element{described, line});
      if (described.kind == Kind::Table) element.table = std::make_unique<TerminalTable>();
      if (described.kind == Kind::TextField)
        element.field = std::make_unique<TerminalTextField>(described.title);
    }
  }
  const auto isField = [](const Element& element) { return element.field != nullptr; };
  auto first = std::ranges::find_if(_elements, isField);
  if (first == _elements.end())
    first = std::ranges::find_if(_elements, [this](const Element& element) { return canHaveFocus(element); });
  if (first != _elements.end()) _focus = static_cast<std::size_t>(first - _elements.begin());
}

TableView* TerminalModalScreen::table(std::string_view outlet) {
  for (const Element& element : _elements) {
    if (element.table && element.described.outlet == outlet) return element.table.get();
  }
  return nullptr;
}

TextField* TerminalModalScreen::textField(std::string_view outlet) {
  for (const Element& element : _elements) {
    if (element.field && element.described.outlet == outlet) return element.field.get();
  }
  return nullptr;
}

void TerminalModalScreen::leave() {
  _actions = nullptr;
  for (const Element& element : _elements) {
    if (element.table) element.table->fallSilent();
    if (element.field) element.field->setDelegate(nullptr);
  }
}

std::wstring TerminalModalScreen::buttonText(const Element& button) {
  const std::wstring blank(button.isNarrow ? 0 : 1, L' ');
  return L"[" + blank + charactersOf(button.described.title) + blank + L"]";
}

int TerminalModalScreen::columnsOfLine(std::size_t line) const {
  int columns = 0;
  for (const Element& element : _elements) {
    if (element.line != line || element.described.kind == Kind::Space) continue;
    const bool isButton = element.described.kind == Kind::Button;
    columns += (columns > 0 ? _spacing : 0) + (isButton ? columnsOf(buttonText(element)) : 1);
  }
  return columns;
}

void TerminalModalScreen::setArea(const Area& area) {
  const auto hasTable = [this](std::size_t line) {
    return std::ranges::any_of(
        _elements, [line](const Element& element) { return element.line == line && element.table; });
  };
  int tables = 0;
  for (std::size_t line = 0; line < _lines; ++line) tables += hasTable(line) ? 1 : 0;
  const int rowsOfTables = std::max(0, area.rows - (static_cast<int>(_lines) - tables));
  int row = area.row;
  for (std::size_t line = 0; line < _lines; ++line) {
    const int wanted = hasTable(line) ? rowsOfTables / tables : 1;
    const int rows = std::clamp(wanted, 0, std::max(0, area.row + area.rows - row));
    layOutLine(line, {area.column + _margin, row, std::max(0, area.columns - 2 * _margin), rows});
    row += rows;
  }
}

// Elements that take as much as there is share what the others leave. Where the line is too long, buttons
// become narrow.
void TerminalModalScreen::layOutLine(std::size_t line, const Area& area) {
  int flexible = 0;
  for (Element& element : _elements) {
    if (element.line != line) continue;
    element.isNarrow = false;
    flexible += element.described.kind == Kind::Button ? 0 : 1;
  }
  const bool isTooLong = columnsOfLine(line) > area.columns;
  for (Element& element : _elements) {
    if (element.line == line) element.isNarrow = isTooLong;
  }
  const int share = flexible == 0 ? 0 : std::max(0, area.columns - columnsOfLine(line)) / flexible;
  int column = area.column;
  for (Element& element : _elements) {
    if (element.line != line) continue;
    const Kind kind = element.described.kind;
    const int wanted = kind == Kind::Button  ? columnsOf(buttonText(element))
                       : kind == Kind::Space ? share
                                             : share + 1;
    const int columns = std::clamp(wanted, 0, std::max(0, area.column + area.columns - column));
    element.area = {column, area.row, columns, area.rows};
    column += columns + (kind == Kind::Space ? 0 : _spacing);
    if (element.table) element.table->setArea(element.area);
  }
}

void TerminalModalScreen::perform(std::string action) {
  const Actions actions = _actions;  // the action may remove the original
  if (actions && !action.empty()) actions(action);
}

void TerminalModalScreen::pressButton(std::string_view title) {
  for (const Element& element : _elements) {
    if (element.described.kind == Kind::Button && element.described.title == title)
      return perform(element.described.action);
  }
}

void TerminalModalScreen::moveFocus(int direction) {
  const std::size_t count = _elements.size();
  for (std::size_t step = 0; step < count; ++step) {
    _focus = (_focus + (direction > 0 ? 1 : count - 1)) % count;
    if (canHaveFocus(_elements[_focus])) return;
  }
}

void TerminalModalScreen::focusButton(std::string_view title) {
  for (std::size_t i = 0; i < _elements.size(); ++i) {
    if (_elements[i].described.kind == Kind::Button && _elements[i].described.title == title) _focus = i;
  }
}

void TerminalModalScreen::take(const Key& key) {
  if (key.isControl(L's')) return pressButton("Save");
  if (key.kind == Key::Kind::Escape) return pressButton("Cancel");
  if (key.kind == Key::Kind::Click) return takeClick(key);
  if (_elements.empty()) return;
  if (key.kind == Key::Kind::Tab || key.kind == Key::Kind::BackTab)
    return moveFocus(key.kind == Key::Kind::Tab ? 1 : -1);
  const Element& element = _elements[_focus];
  if (element.field && element.field->take(key) == KeyUse::Used) {
    // The user has finished the text; what comes next is to save.
    if (element.field->hasResigned()) focusButton("Save");
    return;
  }
  if (element.described.kind == Kind::Button && (key.kind == Key::Kind::Enter || key.is(L' ')))
    return perform(element.described.action);
  if (element.table && element.table->take(key) == KeyUse::Used) return;
  if (key.kind == Key::Kind::Down || key.kind == Key::Kind::Right) moveFocus(1);
  if (key.kind == Key::Kind::Up || key.kind == Key::Kind::Left) moveFocus(-1);
}

void TerminalModalScreen::takeClick(const Key& key) {
  for (std::size_t i = 0; i < _elements.size(); ++i) {
    const Element& element = _elements[i];
    if (!canHaveFocus(element) || !element.area.contains(key.column, key.row)) continue;
    _focus = i;
    if (element.described.kind == Kind::Button) perform(element.described.action);
    if (element.table) element.table->take(key);
    return;
  }
  perform(_backgroundAction);
}

void TerminalModalScreen::paint(CellGrid& grid, const Glyphs& glyphs) const {
  for (std::size_t i = 0; i < _elements.size(); ++i) {
    const Element& element = _elements[i];
    const bool hasFocus = i == _focus;
    if (element.area.rows <= 0 || element.area.columns <= 0) continue;
    if (element.described.kind == Kind::Button) {
      Look look;
      look.isReversed = hasFocus;
      grid.write(element.area.column, element.area.row, buttonText(element), look, element.area);
    }
    if (element.field)
      element.field->paint(grid, element.area,
                           hasFocus ? TerminalTextField::Focus::Has : TerminalTextField::Focus::HasNot);
    if (element.table)
      element.table->paint(grid, hasFocus ? TerminalRow::Emphasis::Focus : TerminalRow::Emphasis::None,
                           glyphs);
  }
}

}  // namespace varnel
