#pragma once

#include <QAbstractScrollArea>
#include <QEvent>
#include <QPointer>
#include <functional>
#include <optional>

#include "widgets/RowWidget.h"

class QScrollEvent;
class QScrollPrepareEvent;
class QTouchEvent;

namespace varnel {

/// A finger on a table: up and down it moves the table, sideways the row that it is on, and a tap chooses a
/// row.
class TouchScrolling final {
 public:
  using RowAt = std::function<RowWidget*(const QPoint& position)>;
  using Tapped = std::function<void(const QPoint& position)>;

  /// The area outlives the object. Positions are the viewport's.
  TouchScrolling(QAbstractScrollArea& area, RowAt rowAt, Tapped tapped);
  /// Takes an event of the viewport; false when the event is none of touch.
  bool take(QEvent& event);

 private:
  void prepare(QScrollPrepareEvent& event);
  void scroll(QScrollEvent& event);
  void begin(QTouchEvent& event);
  void end(QTouchEvent& event);

  QAbstractScrollArea& _area;
  RowAt _rowAt;
  Tapped _tapped;
  QPointer<RowWidget> _row;          // under the finger
  std::optional<QPointF> _tapBegan;  // while it may still become a tap
};

}  // namespace varnel
