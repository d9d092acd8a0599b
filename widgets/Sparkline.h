#pragma once

#include <QColor>
#include <QPainter>
#include <QPixmap>
#include <QSizeF>
#include <optional>
#include <vector>

namespace varnel {

/// The course of a value as a small line. The lowest value is at the bottom and the highest one at the top; a
/// value that does not change is a line in the middle. It keeps its picture until something of it changes.
class Sparkline {
 public:
  /// The oldest value first; nothing where there is a gap.
  using Course = std::vector<std::optional<double>>;

  /// What it looks like.
  struct Look {
    QSizeF size;
    QColor line;
    QColor end;  ///< of the dot at the newest value
    double pixelRatio = 1;

    friend bool operator==(const Look&, const Look&) = default;
  };

  void setCourse(const Course& course);
  /// True when there is a line to paint: at least two values.
  bool hasLine() const { return _hasLine; }
  /// Whether two of the values differ.
  bool changes() const { return _lowest < _highest; }
  /// Paints it with its top left corner here.
  void paint(QPainter& painter, const QPointF& topLeft, const Look& look);
  /// How often the picture was made.
  unsigned timesDrawn() const { return _timesDrawn; }

 private:
  void draw(const Look& look);

  Course _course;
  bool _hasLine = false;
  double _lowest = 0, _highest = 0;
  QPixmap _picture;
  std::optional<Look> _look;  // of the picture; absent when there is none
  unsigned _timesDrawn = 0;
};

}  // namespace varnel
