#pragma once

#include <QPainter>
#include <QWidget>
#include <memory>
#include <vector>

#include "platform/ui/ScrollContainer.h"
#include "widgets/PaintedLabel.h"

namespace varnel {

/// A part of a row that scrolls sideways. The row paints it. The table scrolls it by touch, wheel, and keys.
class PaintedScrollContainer final : public ScrollContainer {
 public:
  struct Colors {
    QColor name;    ///< of the first text
    QColor value;   ///< of the others
    QColor ground;  ///< the background of the row
    QColor bar;
    QColor mark;
  };

  /// The row must outlive the container.
  explicit PaintedScrollContainer(QWidget& row) : _row(row) {}

  Label& addLabel() override;
  void setFrame(const Rect& frame) override;
  void setContentSize(const Size& size) override;

  const std::vector<std::unique_ptr<PaintedLabel>>& labels() const { return _labels; }
  /// How far the labels reach to the right.
  double endOfLabels() const;
  /// How far it can be scrolled; 0 when its content fits.
  double range() const;
  double position() const { return _position; }
  /// Scrolls to the nearest possible position.
  void scrollTo(double position);
  /// False when all of its texts are visible at the same time.
  bool hasMoreThanFits() const;
  /// Paints the labels. If it can be scrolled, also paints a thin bar below them.
  /// Texts that go on past an edge fade out there before three dots.
  void paint(QPainter& painter, const Colors& colors) const;

 private:
  enum class Edge { Left, Right };

  double endOfTexts() const;
  bool goesOnPast(Edge edge) const;
  void paintMore(QPainter& painter, Edge edge, const Colors& colors) const;
  void paintBar(QPainter& painter, const QColor& color) const;

  QWidget& _row;
  std::vector<std::unique_ptr<PaintedLabel>> _labels;
  Rect _frame;
  Size _contentSize;
  double _position = 0;
};

}  // namespace varnel
