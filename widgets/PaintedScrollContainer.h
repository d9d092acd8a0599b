#pragma once

#include <QPainter>
#include <QWidget>
#include <memory>
#include <vector>

#include "platform/ui/ScrollContainer.h"
#include "widgets/PaintedLabel.h"

namespace varnel {

/// A part of a row that scrolls sideways. The row paints it; the table tells it where fingers, wheels and
/// keys move it.
class PaintedScrollContainer final : public ScrollContainer {
 public:
  /// The row outlives the container.
  explicit PaintedScrollContainer(QWidget& row) : _row(row) {}

  Label& addLabel() override;
  void setFrame(const Rect& frame) override;
  void setContentSize(const Size& size) override;

  const std::vector<std::unique_ptr<PaintedLabel>>& labels() const { return _labels; }
  /// How far to the right labels reach.
  double endOfLabels() const;
  /// How far it can be scrolled; 0 when its content fits.
  double range() const;
  double position() const { return _position; }
  /// Scrolls to the nearest position that there is.
  void scrollTo(double position);
  /// Paints labels in the painter's pen, and while there is something to scroll a thin bar below them.
  void paint(QPainter& painter, const QColor& bar) const;

 private:
  void paintBar(QPainter& painter, const QColor& colour) const;

  QWidget& _row;
  std::vector<std::unique_ptr<PaintedLabel>> _labels;
  Rect _frame;
  Size _contentSize;
  double _position = 0;
};

}  // namespace varnel
