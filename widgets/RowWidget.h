#pragma once

#include <QColor>
#include <QFont>
#include <QWidget>
#include <memory>
#include <vector>

#include "platform/ui/TableCell.h"
#include "widgets/PaintedScrollContainer.h"
#include "widgets/Sparkline.h"

namespace varnel {

/// A row of a table: the visible part of a cell. It paints everything on it, so that a row costs only one
/// widget. The table handles mouse and touch.
class RowWidget final : public QWidget, public CellView {
 public:
  /// A row is as wide as its table, but never wider than this, so that the eye finds the value of a name.
  static constexpr int widest = 800;

  /// How the row differs from other rows.
  struct Emphasis {
    bool isSelected = false;
    bool hasFocusFrame = false;
    bool isOpen = false;  ///< the pane to which it leads is beside its table

    bool isPale = false;  ///< commands are for a row elsewhere

    friend bool operator==(const Emphasis&, const Emphasis&) = default;
  };

  /// The parent is the viewport of a table.
  RowWidget(CellStyle style, QWidget& parent);

  void layOut() override;
  Rect contentBounds() const override { return _contentBounds; }
  Label& addLabel() override;
  ScrollContainer& addScrollContainer() override;
  void setAccessory(CellAccessory accessory) override;
  void setText(std::string_view text) override;
  void setTextFont(const Font& font) override;
  void setFacts(CellFacts&& facts) override;
  const CellFacts& facts() const { return _facts; }

  /// The index of the row in the table.
  std::size_t row() const { return _row; }
  /// When the index changes, the row scrolls back to its left end.
  void setRow(std::size_t row);
  void setEmphasis(const Emphasis& emphasis);
  const Emphasis& emphasis() const { return _emphasis; }
  /// Call this after the cell was laid out: labels that reach past the content area can be scrolled.
  void fitLabels();
  /// The text for a screen reader: "name: value", or "name: summary".
  QString description() const;
  /// Where the sparkline is on the row; empty when there is none.
  QRectF sparklineArea() const { return places().sparkline; }
  /// How often the sparkline was drawn anew.
  unsigned sparklinesDrawn() const { return _sparkline.timesDrawn(); }
  /// Whether the row leads to another pane.
  bool leadsOn() const { return _accessory == CellAccessory::DisclosureIndicator; }
  /// The first of the row's texts.
  QString name() const;
  /// True when a part of its text is not visible while the row is at its left end. That text has to be
  /// scrolled, or is cut. The summary counts too.
  bool reachesPastItsEdge() const;
  /// All of the row's text if the row is too short for it, and this explanation of the row below it; empty
  /// if there is neither.
  QString details(const QString& explanation) const;
  /// Shows the details in a tooltip beside the mouse. Without any, hides the tooltip.
  void showTooltip(const QPoint& globalPosition, const QString& explanation) const;

  /// How far the row can be scrolled sideways; 0 when everything fits.
  double sidewaysRange() const;
  double sidewaysPosition() const;
  void scrollSidewaysTo(double position);

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  // Where the row's facts are on it, beside its texts. What has no room is empty.
  struct Places {
    QRectF sparkline, levelMark, summary;
  };

  // Colors that it takes time to find.
  struct FoundColors {
    qint64 palette = -1;  // those that follow are for this palette, ground, and level
    QColor ground;
    CellLevel ofLevel = CellLevel::None;
    QColor dimmedText, accent, level;
  };

  Places places() const;
  void findColors(const QColor& ground);
  void placeBesideValue(Places& places, const PaintedLabel& name, const PaintedLabel& value) const;
  void placeBesideName(Places& places, double endOfName) const;
  std::vector<const PaintedLabel*> filledLabels() const;
  QString shownSummary(double width) const;
  QRectF builtInRoom() const;
  void paintFacts(QPainter& painter, const QColor& ground);
  void paintSummary(QPainter& painter, const QRectF& area, const QColor& ground) const;
  void paintChangeMark(QPainter& painter) const;
  void paintBuiltInText(QPainter& painter) const;
  void paintAccessory(QPainter& painter) const;
  void paintSeparator(QPainter& painter) const;
  void paintFocusFrame(QPainter& painter) const;
  void paintOpenMark(QPainter& painter) const;
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
  CellFacts _facts;
  Sparkline _sparkline;
  FoundColors _colors;
};

}  // namespace varnel
