#pragma once

#include <QAbstractScrollArea>
#include <QEvent>
#include <QPointer>
#include <QTimer>
#include <functional>
#include <optional>

#include "widgets/RowWidget.h"

class QScrollEvent;
class QScrollPrepareEvent;
class QTouchEvent;

namespace varnel {

/// A finger on a table. Up and down it moves the table; sideways it moves the row below it, or the whole
/// table when its rows do not move alone; a tap chooses a row. A finger that rests asks for the menu, like
/// the right mouse button.
class TouchScrolling final {
 public:
  using RowAt = std::function<RowWidget*(const QPoint& position)>;
  using Tapped = std::function<void(const QPoint& position)>;

  /// The area must outlive this object. `rowAt` is null when rows do not move alone. Positions are in the
  /// viewport's coordinates.
  TouchScrolling(QAbstractScrollArea& area, RowAt rowAt, Tapped tapped);
  /// Handles an event of the viewport; false when it is no touch event.
  bool take(QEvent& event);

 private:
  void prepare(QScrollPrepareEvent& event);
  void scroll(QScrollEvent& event);
  void begin(QTouchEvent& event);
  void move(QTouchEvent& event);
  double sidewaysRange() const;
  double sidewaysPosition() const;
  void end(QTouchEvent& event);
  void askForMenu();

  QAbstractScrollArea& _area;
  RowAt _rowAt;
  Tapped _tapped;
  QPointer<RowWidget> _row;          // the row under the finger
  QTimer _rest;                      // runs while the touch may still become a rest
  std::optional<QPointF> _tapBegan;  // set while the touch may still become a tap
};

}  // namespace varnel
