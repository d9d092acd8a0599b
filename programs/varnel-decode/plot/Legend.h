#pragma once

#include <QGraphicsItemGroup>
#include <QPen>
#include <QString>
#include <vector>

namespace varnel {

/// Which line stands for what.
struct LegendEntry {
  QString text;
  QPen pen;
};

/// The entries in as many rows as they need at that width, from the item's origin on; a text that is wider is
/// shortened in its middle. The chart library's own legend has one row and hides what does not fit.
class Legend final : public QGraphicsItemGroup {
 public:
  Legend(const std::vector<LegendEntry>& entries, double width);

  double height() const { return _height; }

 private:
  double _height;
};

}  // namespace varnel
