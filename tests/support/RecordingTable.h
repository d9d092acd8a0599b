#pragma once

#include <algorithm>
#include <map>
#include <memory>
#include <ostream>
#include <stdexcept>
#include <string>
#include <vector>

#include "platform/ui/CellPool.h"
#include "platform/ui/TableView.h"
#include "platform/ui/TextMetrics.h"

namespace varnel {

inline void PrintTo(const Rect& rect, std::ostream* out) {
  *out << "(" << rect.x << ", " << rect.y << ", " << rect.width << ", " << rect.height << ")";
}
inline void PrintTo(const Size& size, std::ostream* out) {
  *out << "(" << size.width << ", " << size.height << ")";
}

/// Bold letters are 10 wide and 20 high at any size, regular ones 7 wide and 16 high. So a test gets a width
/// by counting letters.
class LetterMetrics final : public TextMetrics {
 public:
  Size sizeOfText(std::string_view text, const Font& font) const override {
    const auto letters = static_cast<double>(text.size());
    return font.weight == Font::Weight::Bold ? Size{10 * letters, 20} : Size{7 * letters, 16};
  }
};

class RecordingLabel final : public Label {
 public:
  void setFont(const Font& font) override { this->font = font; }
  void setText(std::string_view text) override { _text = text; }
  std::string text() const override { return _text; }
  void setFrame(const Rect& frame) override { this->frame = frame; }

  Font font;
  Rect frame;

 private:
  std::string _text;
};

class RecordingScrollContainer final : public ScrollContainer {
 public:
  Label& addLabel() override { return *labels.emplace_back(std::make_unique<RecordingLabel>()); }
  void setFrame(const Rect& frame) override { this->frame = frame; }
  void setContentSize(const Size& size) override { contentSize = size; }

  std::vector<std::unique_ptr<RecordingLabel>> labels;
  Rect frame;
  Size contentSize;
};

/// A cell in a row of the width that the test sets.
class RecordingCellView final : public CellView {
 public:
  RecordingCellView(CellStyle style, const Rect& row) : style(style), _row(row) {}

  void layOut() override {
    ++layouts;
    _bounds = _row;
  }
  Rect contentBounds() const override { return _bounds; }
  Label& addLabel() override { return *labels.emplace_back(std::make_unique<RecordingLabel>()); }
  ScrollContainer& addScrollContainer() override {
    return *containers.emplace_back(std::make_unique<RecordingScrollContainer>());
  }
  void setAccessory(CellAccessory accessory) override { this->accessory = accessory; }
  void setText(std::string_view text) override { this->text = text; }
  void setTextFont(const Font& font) override { textFont = font; }
  void setFacts(CellFacts&& facts) override { this->facts = std::move(facts); }

  const CellStyle style;
  std::vector<std::unique_ptr<RecordingLabel>> labels;
  std::vector<std::unique_ptr<RecordingScrollContainer>> containers;
  CellAccessory accessory = CellAccessory::None;
  std::string text;
  Font textFont;
  CellFacts facts;
  unsigned layouts = 0;

 private:
  const Rect& _row;
  Rect _bounds;  // empty before the first layout
};

/// A table on a screen of `visibleRows` rows.
class RecordingTable final : public TableView {
 public:
  void setDelegate(TableViewDelegate* delegate) override { _delegate = delegate; }

  void reloadData() override {
    ++reloads;
    load();
  }
  void showFactsAgain() override {
    for (const auto& [row, cell] : _visible) _delegate->tableView_showFactsInCell(*this, *cell, {0, row});
  }
  std::unique_ptr<TableCell> dequeueReusableCell(std::string_view reuseIdentifier) override {
    if (auto cell = _reloaded.take(reuseIdentifier)) return cell;
    return _pool.take(reuseIdentifier);
  }
  std::unique_ptr<CellView> makeCellView(CellStyle style) override {
    ++cellsMade;
    return std::make_unique<RecordingCellView>(style, content);
  }
  void selectRow(const IndexPath& path) override {
    if (path.section == 0 && path.row < _rows) _selected = path;
  }
  void deselectRow(const IndexPath& path, Animation animation) override {
    if (_selected == path) _selected.reset();
    deselections.push_back(animation);
  }
  void sizeToFit() override { isSizedToFit = true; }

  /// What a table does when it first appears on the screen.
  void appear() {
    if (!_isLoaded) load();
  }
  /// The user scrolls down by this many rows.
  void scroll(std::size_t rows) {
    _firstVisible += rows;
    showVisibleRows();
  }
  void select(std::size_t row) {
    _selected = IndexPath{0, row};
    _delegate->tableView_didSelectRowAtIndexPath(*this, _selected);
  }
  /// Selects no row.
  void selectNothing() { _delegate->tableView_didSelectRowAtIndexPath(*this, std::nullopt); }
  const std::optional<IndexPath>& selected() const { return _selected; }
  /// Changes the width of the table.
  void resize(double width) {
    content.width = width;
    for (auto& [row, cell] : _visible) cell->layOutAgain();
  }

  /// The number of rows at the last reload.
  std::size_t rows() const { return _rows; }
  /// The cell of a visible row.
  TableCell& cell(std::size_t row) const { return *_visible.at(row); }
  RecordingCellView& cellView(std::size_t row) const {
    return static_cast<RecordingCellView&>(cell(row).cellView());
  }
  std::size_t visibleCells() const { return _visible.size(); }

  /// The content area of every cell.
  Rect content{0, 0, 300, 50};
  std::size_t visibleRows = 8;
  unsigned reloads = 0;
  unsigned cellsMade = 0;
  bool isSizedToFit = false;
  std::vector<Animation> deselections;

 private:
  void load() {
    _isLoaded = true;
    if (_delegate && _delegate->numberOfSectionsInTableView(*this) != 1)
      throw std::logic_error("a table has one section");
    const std::size_t formerRows = _rows;
    _rows = _delegate ? _delegate->tableView_numberOfRowsInSection(*this, 0) : 0;
    putAway(_reloaded, [](std::size_t) { return true; });
    if (_rows != formerRows) {
      _reloaded = CellPool();
      _pool = CellPool();
    }
    showVisibleRows();
    _reloaded = CellPool();
  }
  void showVisibleRows() {
    const std::size_t end = std::min(_rows, _firstVisible + visibleRows);
    putAway(_pool, [&](std::size_t row) { return row < _firstVisible || row >= end; });
    for (std::size_t row = _firstVisible; row < end; ++row) {
      if (!_visible.contains(row))
        _visible[row] = _delegate->tableView_cellForRowAtIndexPath(*this, {0, row});
    }
  }
  template <class Condition>
  void putAway(CellPool& pool, Condition condition) {
    for (auto next = _visible.begin(); next != _visible.end();) {
      const auto current = next++;
      if (condition(current->first)) pool.put(std::move(_visible.extract(current).mapped()));
    }
  }

  TableViewDelegate* _delegate = nullptr;
  bool _isLoaded = false;
  std::size_t _rows = 0;
  std::size_t _firstVisible = 0;
  std::map<std::size_t, std::unique_ptr<TableCell>> _visible;  // by row
  std::optional<IndexPath> _selected;
  CellPool _reloaded;  // cells that were visible when a reload began; the table drops those that no row takes
  CellPool _pool;      // cells that were scrolled away
};

}  // namespace varnel
