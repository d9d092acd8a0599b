#pragma once

#include <QPointF>
#include <cstddef>

#include "widgets/RowWidget.h"

namespace varnel {

/// The mouse's left button held down on a row of a table. A sideways movement drags a row that can be
/// scrolled. Releasing the button without such a movement chooses the row.
class MousePress final {
 public:
  /// Positions are in the viewport's coordinates.
  MousePress(const RowWidget& row, const QPointF& position)
      : _row(row.row()), _position(position), _sidewaysPosition(row.sidewaysPosition()) {}

  /// The index of the row in the table.
  std::size_t row() const { return _row; }
  bool isDrag() const { return _isDrag; }
  /// `row` is the widget that currently shows the row.
  void moveTo(const QPointF& position, RowWidget& row);

 private:
  std::size_t _row;
  QPointF _position;
  double _sidewaysPosition;
  bool _isDrag = false;
};

}  // namespace varnel
