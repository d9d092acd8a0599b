#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/ui/TableCell.h"
#include "terminal/CellGrid.h"
#include "terminal/Glyphs.h"

namespace varnel {

class TerminalLabel final : public Label {
 public:
  void setFont(const Font& font) override { _font = font; }
  void setText(std::string_view text) override;
  std::string text() const override { return _text; }
  void setFrame(const Rect& frame) override;

  const std::wstring& shownText() const { return _shownText; }
  bool isBold() const { return _font.weight == Font::Weight::Bold; }
  /// The first column, counted from that of the parent.
  int column() const { return _column; }
  /// The column after the text.
  int end() const;

 private:
  Font _font;
  std::string _text;
  std::wstring _shownText;
  int _column = 0;
};

/// A part of a row that scrolls sideways, by the keys of its table.
class TerminalScrollContainer final : public ScrollContainer {
 public:
  Label& addLabel() override { return *_labels.emplace_back(std::make_unique<TerminalLabel>()); }
  void setFrame(const Rect& frame) override;
  void setContentSize(const Size& size) override;

  const std::vector<std::unique_ptr<TerminalLabel>>& labels() const { return _labels; }
  /// How many columns it can be scrolled; 0 when all of its texts are visible.
  int range() const;
  int position() const { return _position; }
  /// Scrolls to the nearest possible column.
  void scrollTo(int column);
  int endOfTexts() const;
  /// The columns of the row that it takes.
  int column() const { return _column; }
  int columns() const { return _columns; }

 private:
  std::vector<std::unique_ptr<TerminalLabel>> _labels;
  int _column = 0;
  int _columns = 0;
  int _position = 0;
};

/// A row of a table: the visible part of a cell, on one row of the terminal.
class TerminalRow final : public CellView {
 public:
  /// How the row differs from other rows.
  enum class Emphasis {
    None,
    Focus,   ///< the keys go on from here
    Opened,  ///< the user has opened it; its pane stands beside
  };

  /// `columns` is the width of the table, which changes it.
  TerminalRow(CellStyle style, const int& columns) : _style(style), _columns(columns) {}

  void layOut() override;
  Rect contentBounds() const override { return _contentBounds; }
  Label& addLabel() override { return _labels.addLabel(); }
  ScrollContainer& addScrollContainer() override;
  void setAccessory(CellAccessory accessory) override { _accessory = accessory; }
  void setText(std::string_view text) override;
  void setTextFont(const Font& font) override { _textFont = font; }
  void setFacts(CellFacts&& facts) override {
    _change = facts.change;
    _course = std::move(facts.course);
  }

  /// The first of its texts.
  std::wstring name() const;

  /// The row was laid out: labels that are no part of a container can be scrolled too.
  void fitLabels();
  int sidewaysRange() const { return scrolledPart().range(); }
  int sidewaysPosition() const { return scrolledPart().position(); }
  void scrollSidewaysTo(int column);

  void paint(CellGrid& grid, const Area& area, Emphasis emphasis, const Glyphs& glyphs) const;

 private:
  const TerminalScrollContainer& scrolledPart() const;
  std::vector<const TerminalLabel*> filledLabels() const;
  void paintPart(CellGrid& grid, const Area& area, const TerminalScrollContainer& part, const Look& look,
                 const Glyphs& glyphs) const;
  void paintCourse(CellGrid& grid, const Area& area, const Look& look, const Glyphs& glyphs) const;

  const CellStyle _style;
  const int& _columns;
  Rect _contentBounds;
  TerminalScrollContainer _labels;
  std::vector<std::unique_ptr<TerminalScrollContainer>> _containers;
  CellAccessory _accessory = CellAccessory::None;
  CellChange _change = CellChange::None;
  std::vector<std::optional<double>> _course;
  std::wstring _builtInText;
  std::optional<Font> _textFont;
};

}  // namespace varnel
