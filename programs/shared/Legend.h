#pragma once

#include <QGraphicsItemGroup>
#include <QPen>
#include <QString>
#include <vector>

namespace varnel {

/// The name and the look of a line.
struct LegendEntry {
  QString text;
  QPen pen;
};

/// The entries in as many rows as they need at this width, from the item's origin. A text that is too wide is
/// shortened in its middle. The chart library's own legend has one row and hides what does not fit.
class Legend final : public QGraphicsItemGroup {
 public:
  Legend(const std::vector<LegendEntry>& entries, double width);

  double height() const { return _height; }

 private:
  double _height;
};

}  // namespace varnel
