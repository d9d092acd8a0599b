#include "terminal/CoursePage.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>

#include "terminal/Characters.h"

namespace varnel {

namespace {

constexpr std::array<std::chrono::minutes, 4> lengths{std::chrono::minutes(1), std::chrono::minutes(5),
                                                      std::chrono::minutes(20), std::chrono::minutes(60)};
constexpr std::wstring_view keys = L" + - Time  q Back ";
constexpr int narrowestAxis = 10;  // columns for the numbers on the left

std::wstring numberText(double number, unsigned decimals) {
  char text[64];
  std::snprintf(text, sizeof text, "%.*f", static_cast<int>(decimals), number);
  return charactersOf(text);
}

struct Scale {
  double lowest = 0;
  double highest = 0;
};

std::optional<Scale> scaleOf(const CourseColumns& course) {
  std::optional<Scale> scale;
  for (const auto& column : course.columns) {
    if (!column) continue;
    if (!scale) scale = Scale{column->lowest, column->highest};
    scale->lowest = std::min(scale->lowest, column->lowest);
    scale->highest = std::max(scale->highest, column->highest);
  }
  if (scale && scale->lowest == scale->highest) {
    scale->lowest -= 1;
    scale->highest += 1;
  }
  return scale;
}

int axisOf(const CourseColumns& course) {
  const auto scale = scaleOf(course);
  if (!scale) return narrowestAxis;
  return std::max({narrowestAxis, columnsOf(numberText(scale->lowest, course.decimals)) + 1,
                   columnsOf(numberText(scale->highest, course.decimals)) + 1});
}

// A bar from the bottom up to the highest value of the column.
void paintBar(CellGrid& grid, int column, const Area& area, const CourseColumns::Range& range,
              const Scale& scale, const Glyphs& glyphs) {
  const auto steps = static_cast<int>(glyphs.blocks.size());
  const double share = (range.highest - scale.lowest) / (scale.highest - scale.lowest);
  const int filled =
      std::clamp(static_cast<int>(std::lround(share * area.rows * steps)), 1, area.rows * steps);
  for (int row = 0; row < area.rows; ++row) {
    const int inRow = std::clamp(filled - row * steps, 0, steps);
    if (inRow == 0) return;
    Look look;
    look.ink = Ink::Mark;
    grid.write(column, area.row + area.rows - 1 - row,
               glyphs.blocks.substr(static_cast<std::size_t>(inRow - 1), 1), look);
  }
}

}  // namespace

std::chrono::minutes CoursePage::length() const { return lengths[_length]; }

Overlay::Wish CoursePage::take(const Key& key) {
  if (key.is(L'+') && _length + 1 < lengths.size()) ++_length;
  if (key.is(L'-') && _length > 0) --_length;
  const bool isWayBack = key.kind == Key::Kind::Escape || key.kind == Key::Kind::Left ||
                         key.kind == Key::Kind::Backspace || key.is(L'q') || key.is(L'h') || key.is(L'T');
  return isWayBack ? Wish::Close : Wish::Stay;
}

void CoursePage::paint(CellGrid& grid, const Glyphs& glyphs) {
  const Look bar{false, true, Ink::Plain};
  Look bold = bar;
  bold.isBold = true;
  grid.fill(grid.area());
  auto course = _source(length(), grid.columns());
  const int axis = course ? axisOf(*course) : narrowestAxis;
  const int left = grid.columns() > 3 * axis ? axis : 0;
  const Area plot{left, 2, std::max(1, grid.columns() - left), std::max(0, grid.rows() - 4)};
  if (left > 0) course = _source(length(), plot.columns);
  grid.fill({0, 0, grid.columns(), 1}, bar);
  std::wstring title = course ? charactersOf(course->name) : L"This value has gone";
  if (course && !course->unit.empty()) title += L" in " + charactersOf(course->unit);
  grid.write(1, 0, cutTo(title, grid.columns() - 2, glyphs.more), bold);
  const int last = grid.rows() - 1;
  if (course) {
    grid.write(1, 1, cutTo(charactersOf(course->summary), grid.columns() - 2, glyphs.more));
    if (const auto scale = scaleOf(*course); scale && plot.rows > 0) {
      if (left > 0) {
        const std::wstring top = numberText(scale->highest, course->decimals);
        const std::wstring bottom = numberText(scale->lowest, course->decimals);
        grid.write(left - 1 - columnsOf(top), plot.row, top);
        if (plot.rows > 1) grid.write(left - 1 - columnsOf(bottom), plot.row + plot.rows - 1, bottom);
      }
      const int count = std::min(plot.columns, static_cast<int>(course->columns.size()));
      for (int column = 0; column < count; ++column) {
        if (const auto& range = course->columns[static_cast<std::size_t>(column)])
          paintBar(grid, plot.column + column, plot, *range, *scale, glyphs);
      }
    }
    if (last - 1 > 1) {
      const std::wstring end = charactersOf(course->end);
      grid.write(plot.column, last - 1, charactersOf(course->begin));
      grid.write(grid.columns() - columnsOf(end), last - 1, end);
    }
  }
  grid.fill({0, last, grid.columns(), 1}, bar);
  const std::wstring shown =
      L" " + std::to_wstring(length().count()) + (length().count() == 1 ? L" minute" : L" minutes");
  grid.write(0, last, cutTo(shown, grid.columns(), glyphs.more), bar);
  if (columnsOf(shown) + columnsOf(keys) < grid.columns())
    grid.write(grid.columns() - columnsOf(keys), last, keys, bar);
}

}  // namespace varnel
