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
  /// What is painted beside the texts.
  struct Colours {
    QColor ground;  ///< what the row is painted on
    QColor bar;
    QColor mark;
  };

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
  /// False when all of its texts can be seen at once.
  bool hasMoreThanFits() const;
  /// Paints labels in the painter's pen, and while there is something to scroll a thin bar below them. Where
  /// texts go on past an edge, they fade out there before three dots.
  void paint(QPainter& painter, const Colours& colours) const;

 private:
  enum class Edge { Left, Right };

  double endOfTexts() const;
  bool goesOnPast(Edge edge) const;
  void paintMore(QPainter& painter, Edge edge, const Colours& colours) const;
  void paintBar(QPainter& painter, const QColor& colour) const;

  QWidget& _row;
  std::vector<std::unique_ptr<PaintedLabel>> _labels;
  Rect _frame;
  Size _contentSize;
  double _position = 0;
};

}  // namespace varnel
