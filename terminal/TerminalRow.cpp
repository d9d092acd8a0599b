#include "terminal/TerminalRow.h"

#include <algorithm>

#include "terminal/Characters.h"
#include "terminal/Course.h"
#include "terminal/TerminalMetrics.h"

namespace varnel {

namespace {

// On the row with the focus, which is reversed, colors would be patches of the background.
Look inked(Look look, Ink ink) {
  if (!look.isReversed) look.ink = ink;
  return look;
}

constexpr int roomOfAccessory = 2;  // a blank and the mark
constexpr int builtInTextColumn = 1;
constexpr int columnOfChangeMark = 0;

constexpr int gapOfCourse = 2;
constexpr int shortestCourse = 8;
constexpr int longestCourse = 24;
// The course ends at the same column in most rows, whatever their values are.
constexpr int usualRoomOfValue = 16;

}  // namespace

void TerminalLabel::setText(std::string_view text) {
  if (text == _text) return;
  _text = text;
  _shownText = charactersOf(text);
}

void TerminalLabel::setFrame(const Rect& frame) { _column = wholeColumns(frame.x); }

int TerminalLabel::end() const { return _column + columnsOf(_shownText); }

void TerminalScrollContainer::setFrame(const Rect& frame) {
  const Area area = areaOf(frame);
  _column = area.column;
  _columns = area.columns;
  scrollTo(_position);
}

void TerminalScrollContainer::setContentSize(const Size&) { scrollTo(_position); }

int TerminalScrollContainer::endOfTexts() const {
  int end = 0;
  for (const auto& label : _labels) {
    if (!label->shownText().empty()) end = std::max(end, label->end());
  }
  return end;
}

// A terminal scrolls only until the end of the text is visible.
int TerminalScrollContainer::range() const { return std::max(0, endOfTexts() - _columns); }

void TerminalScrollContainer::scrollTo(int column) { _position = std::clamp(column, 0, range()); }

void TerminalRow::layOut() {
  _contentBounds = {0, 0, std::max(0, _columns - roomOfAccessory) * columnWidth, rowHeight};
}

ScrollContainer& TerminalRow::addScrollContainer() {
  return *_containers.emplace_back(std::make_unique<TerminalScrollContainer>());
}

void TerminalRow::setText(std::string_view text) { _builtInText = charactersOf(text); }

void TerminalRow::fitLabels() {
  _labels.setFrame({0, 0, std::max(0, _columns - roomOfAccessory) * columnWidth, rowHeight});
  for (const auto& container : _containers) container->scrollTo(container->position());
}

std::vector<const TerminalLabel*> TerminalRow::filledLabels() const {
  std::vector<const TerminalLabel*> filled;
  const auto add = [&filled](const TerminalScrollContainer& part) {
    for (const auto& label : part.labels()) {
      if (!label->shownText().empty()) filled.push_back(label.get());
    }
  };
  add(_labels);
  for (const auto& container : _containers) add(*container);
  return filled;
}

std::wstring TerminalRow::name() const {
  if (!_builtInText.empty()) return _builtInText;
  const auto labels = filledLabels();
  return labels.empty() ? std::wstring() : labels.front()->shownText();
}

const TerminalScrollContainer& TerminalRow::scrolledPart() const {
  return _containers.empty() ? _labels : *_containers.front();
}

void TerminalRow::scrollSidewaysTo(int column) {
  _labels.scrollTo(column);
  for (const auto& container : _containers) container->scrollTo(column);
}

void TerminalRow::paint(CellGrid& grid, const Area& area, Emphasis emphasis, const Glyphs& glyphs) const {
  const Look look{false, emphasis == Emphasis::Focus, Ink::Plain};
  grid.fill(area, look);
  if (!_builtInText.empty()) {
    Look bold = look;
    bold.isBold = _textFont ? _textFont->weight == Font::Weight::Bold : _style == CellStyle::NameAndDetail;
    const int room = area.columns - builtInTextColumn - roomOfAccessory;
    grid.write(area.column + builtInTextColumn, area.row, cutTo(_builtInText, room, glyphs.more), bold, area);
  }
  paintPart(grid, area, _labels, look, glyphs);
  for (const auto& container : _containers) paintPart(grid, area, *container, look, glyphs);
  paintCourse(grid, area, look, glyphs);
  Look mark = inked(look, Ink::Mark);
  if (emphasis == Emphasis::Opened) mark.isReversed = true;
  const int last = area.column + area.columns - 1;
  if (_accessory == CellAccessory::DisclosureIndicator)
    grid.write(last, area.row, glyphs.disclosure, mark, area);
  if (_accessory == CellAccessory::Checkmark) grid.write(last, area.row, glyphs.checkmark, mark, area);
  if (_change == CellChange::Changed) {
    mark = inked(look, Ink::Change);
    mark.isBold = true;
    grid.write(area.column + columnOfChangeMark, area.row, glyphs.change, mark, area);
  }
}

void TerminalRow::paintPart(CellGrid& grid, const Area& area, const TerminalScrollContainer& part,
                            const Look& look, const Glyphs& glyphs) const {
  if (part.columns() <= 0) return;
  const Area inside{area.column + part.column(), area.row,
                    std::min(part.columns(), area.columns - part.column()), area.rows};
  bool goesOnToTheLeft = false;
  for (const auto& label : part.labels()) {
    if (label->shownText().empty()) continue;
    Look its = look;
    its.isBold = label->isBold();
    if (_change == CellChange::Changed && !label->isBold()) its = inked(its, Ink::Change);
    grid.write(inside.column + label->column() - part.position(), area.row, label->shownText(), its, inside);
    goesOnToTheLeft |= label->column() < part.position();
  }
  const Look mark = inked(look, Ink::Mark);
  if (goesOnToTheLeft) grid.write(inside.column, area.row, glyphs.more, mark, inside);
  if (part.endOfTexts() - part.position() > part.columns())
    grid.write(inside.column + inside.columns - 1, area.row, glyphs.more, mark, inside);
}

// Between the name and the value.
void TerminalRow::paintCourse(CellGrid& grid, const Area& area, const Look& look,
                              const Glyphs& glyphs) const {
  const auto labels = filledLabels();
  if (_course.empty() || labels.size() != 2 || scrolledPart().range() > 0) return;
  const int content = wholeColumns(_contentBounds.width);
  const int end = std::min(labels.back()->column() - gapOfCourse, content - usualRoomOfValue);
  const int room = std::min(longestCourse, end - labels.front()->end() - gapOfCourse);
  if (room < shortestCourse) return;
  const Look its = inked(look, Ink::Mark);
  const std::wstring line = courseInBlocks(_course, room, glyphs);
  grid.write(area.column + end - columnsOf(line), area.row, line, its, area);
}

}  // namespace varnel
