#include "widgets/MousePress.h"

#include <QApplication>
#include <cmath>

namespace varnel {

void MousePress::moveTo(const QPointF& position, RowWidget& row) {
  const double movement = position.x() - _position.x();
  if (row.sidewaysRange() == 0) return;
  if (std::abs(movement) >= QApplication::startDragDistance()) _isDrag = true;
  if (_isDrag) row.scrollSidewaysTo(_sidewaysPosition - movement);
}

}  // namespace varnel
