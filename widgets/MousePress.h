#pragma once

#include <QPointF>
#include <cstddef>

#include "widgets/RowWidget.h"

namespace varnel {

/// The mouse's left button held down on a row of a table. Moved sideways, it drags along a row that can be
/// scrolled. Let go without that, it chooses the row.
class MousePress final {
 public:
  /// Positions are the viewport's.
  MousePress(const RowWidget& row, const QPointF& position)
      : _row(row.row()), _position(position), _sidewaysPosition(row.sidewaysPosition()) {}

  /// Which of the table's rows it is on.
  std::size_t row() const { return _row; }
  bool isDrag() const { return _isDrag; }
  /// Called with the widget that the row has by now.
  void moveTo(const QPointF& position, RowWidget& row);

 private:
  std::size_t _row;
  QPointF _position;
  double _sidewaysPosition;
  bool _isDrag = false;
};

}  // namespace varnel
