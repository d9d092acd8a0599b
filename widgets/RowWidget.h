#pragma once

#include <QColor>
#include <QFont>
#include <QWidget>
#include <memory>
#include <vector>

#include "platform/ui/TableCell.h"
#include "widgets/PaintedScrollContainer.h"

namespace varnel {

/// A row of a table: a cell's part on the screen. It paints all that stands on it, so that a row costs one
/// widget, and leaves mouse and touch to the table.
class RowWidget final : public QWidget, public CellView {
 public:
  /// How the row stands out among the others.
  struct Emphasis {
    bool isSelected = false;
    bool hasFocusFrame = false;

    friend bool operator==(const Emphasis&, const Emphasis&) = default;
  };

  /// The parent is a table's viewport, as wide as the rows are.
  RowWidget(CellStyle style, QWidget& parent);

  void layOut() override;
  Rect contentBounds() const override { return _contentBounds; }
  Label& addLabel() override;
  ScrollContainer& addScrollContainer() override;
  void setAccessory(CellAccessory accessory) override;
  void setText(std::string_view text) override;
  void setTextFont(const Font& font) override;

  /// Which of the table's rows it shows.
  std::size_t row() const { return _row; }
  /// A row that comes to show another than it did begins at its left end.
  void setRow(std::size_t row);
  void setEmphasis(const Emphasis& emphasis);
  const Emphasis& emphasis() const { return _emphasis; }
  /// To be called when the cell has been laid out: labels that reach past the content area can be scrolled.
  void fitLabels();
  /// What a screen reader reads: "name: value".
  QString description() const;
  /// What the row is called: the first of its texts.
  QString name() const;
  /// True when a part of its text cannot be seen where the row begins, so that it has to be scrolled, or is
  /// cut.
  bool reachesPastItsEdge() const;
  /// Shows all of a text that the row is too short for, beside the mouse; takes away any tooltip otherwise.
  void showTooltip(const QPoint& globalPosition) const;

  /// How far it can be scrolled sideways; 0 when everything fits.
  double sidewaysRange() const;
  double sidewaysPosition() const;
  void scrollSidewaysTo(double position);

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  QRectF builtInRoom() const;
  void paintBuiltInText(QPainter& painter) const;
  void paintAccessory(QPainter& painter) const;
  void paintSeparator(QPainter& painter) const;
  void paintFocusFrame(QPainter& painter) const;
  double accessoryWidth() const;
  Rect contentArea() const;
  const PaintedScrollContainer& scrolledPart() const;

  std::size_t _row = 0;
  Rect _contentBounds;
  PaintedScrollContainer _labels;
  std::vector<std::unique_ptr<PaintedScrollContainer>> _containers;
  CellAccessory _accessory = CellAccessory::None;
  QString _builtInText;
  QFont _builtInFont;
  Emphasis _emphasis;
};

}  // namespace varnel
