#pragma once

#include <QGraphicsScene>
#include <QGraphicsView>
#include <functional>
#include <optional>

#include "programs/varnel/trends/TrendChart.h"
#include "programs/varnel/trends/TrendStretch.h"

class QGestureEvent;
class QHelpEvent;

namespace varnel {

/// Shows a picture of courses. The wheel, two fingers, and the keys + and - zoom; dragging and the arrow keys
/// move in time; the mouse, a tap, or Shift with the arrow keys move the cursor.
class TrendView final : public QGraphicsView {
 public:
  TrendView(TrendSource& source, QWidget* parent);

  /// The rows of the picture, by their keys.
  void setRows(std::vector<std::string> keys);
  TrendStretch& stretch() { return _stretch; }
  /// Shows what the source has now.
  void refresh();
  /// Called whenever something else is shown.
  void setObserver(std::function<void()> observer) { _observer = std::move(observer); }

  const TrendData& data() const { return _data; }
  /// The column under the cursor; absent when there is none.
  std::optional<std::size_t> cursor() const { return _cursor; }
  /// Moves the cursor to this column.
  void showCursor(std::size_t column) { setCursorColumn(column); }
  TrendChart& chart() { return *_chart; }

 protected:
  bool viewportEvent(QEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void changeEvent(QEvent* event) override;
  void wheelEvent(QWheelEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseMoveEvent(QMouseEvent* event) override;
  void mouseReleaseEvent(QMouseEvent* event) override;
  void leaveEvent(QEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;

 private:
  void takeLook();
  void showTooltip(const QHelpEvent& event);
  void pinch(const QGestureEvent& event);
  double shareAt(double x) const;
  void moveCursorTo(double x);
  void setCursorColumn(std::optional<std::size_t> column);
  void stepCursor(int columns);
  QStringList cursorTexts() const;

  TrendSource& _source;
  QGraphicsScene _scene;
  TrendChart* _chart;  // the scene's
  TrendStretch _stretch;
  std::vector<std::string> _keys;
  TrendData _data;
  std::function<void()> _observer;
  std::optional<std::size_t> _cursor;
  struct Drag {
    double x;
    bool hasMoved;
  };
  std::optional<Drag> _drag;
};

}  // namespace varnel
