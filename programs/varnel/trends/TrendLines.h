#pragma once

#include <QGraphicsObject>
#include <optional>

#include "programs/varnel/trends/TrendData.h"
#include "programs/varnel/trends/TrendLook.h"
#include "programs/varnel/trends/TrendScale.h"

namespace varnel {

/// Everything within the axes: the lines, marks for events, the playing position, and the cursor. The chart
/// library's own lines know no gaps and have one width, so these are painted here, column by column: the time
/// for it does not depend on the length of the history.
class TrendLines final : public QGraphicsItem {
 public:
  explicit TrendLines(QGraphicsItem* parent) : QGraphicsItem(parent) {}

  /// `scales` has one for each line. The data must live until the next call.
  void show(const TrendData& data, std::vector<TrendScale> scales, const TrendLook& look);
  void setArea(const QRectF& area);
  const QRectF& area() const { return _area; }

  /// The cursor stands at this column, with these lines of text beside it; the first one is the time.
  void showCursor(std::optional<std::size_t> column, const QStringList& texts);

  /// Events within some points of this place.
  std::vector<TrendSource::Event> eventsAt(double x) const;
  std::vector<TrendSource::Event> eventsAtColumn(std::size_t column) const;

  QRectF boundingRect() const override { return _area.adjusted(-margin, -margin, margin, margin); }
  void paint(QPainter* painter, const QStyleOptionGraphicsItem* option, QWidget* widget) override;

 private:
  static constexpr double margin = 8;

  double xOf(TrendSource::Duration at) const;
  double xOfColumn(std::size_t column) const;
  double yOf(std::size_t line, double value) const;
  void paintEvents(QPainter& painter) const;
  void paintLine(QPainter& painter, std::size_t line) const;
  void paintClockSets(QPainter& painter) const;
  void paintPlaying(QPainter& painter) const;
  void paintCursor(QPainter& painter) const;

  const TrendData* _data = nullptr;
  std::vector<TrendScale> _scales;
  TrendLook _look;
  QRectF _area;
  std::optional<std::size_t> _cursor;
  QStringList _cursorTexts;
};

}  // namespace varnel
