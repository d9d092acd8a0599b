#pragma once

#include <QGraphicsItem>
#include <QPainterPath>
#include <QWidget>
#include <string_view>
#include <vector>

#include "programs/varnel/trends/TrendLook.h"
#include "programs/varnel/trends/TrendSource.h"

namespace varnel {

/// The width and the height of a mark.
inline constexpr double eventMarkSize = 9;

/// The mark of an event around this point.
QPainterPath eventMark(EventKind kind, QPointF center);

/// What the marks of a picture stand for, of those kinds alone that occur in it.
class EventLegend final {
 public:
  EventLegend() = default;
  EventLegend(const std::vector<TrendSource::Event>& events, const TrendLook& look);

  bool isEmpty() const { return _entries.empty(); }
  /// The names of the kinds, with commas between them.
  QString text() const;
  double heightFor(double width) const;
  /// Paints from this point on, in as many lines as it needs.
  void paint(QPainter& painter, QPointF from, double width) const;

  friend bool operator==(const EventLegend& one, const EventLegend& other) {
    return one._entries == other._entries && one._look.text == other._look.text &&
           one._look.font == other._look.font;
  }

 private:
  struct Entry {
    EventKind kind{};
    std::string_view name{};
    friend bool operator==(const Entry&, const Entry&) = default;
  };
  struct Place {
    QPointF at;  // the left end, in the middle of the line
    Entry entry;
  };
  std::vector<Place> placesFor(double width) const;

  TrendLook _look;
  std::vector<Entry> _entries;
};

/// The legend in a picture that is saved.
class EventLegendItem final : public QGraphicsItem {
 public:
  EventLegendItem(EventLegend legend, double width) : _legend(std::move(legend)), _width(width) {}

  QRectF boundingRect() const override { return {0, 0, _width, _legend.heightFor(_width)}; }
  void paint(QPainter* painter, const QStyleOptionGraphicsItem* option, QWidget* widget) override;

 private:
  EventLegend _legend;
  double _width;
};

/// The legend below the picture of a page. It is hidden while there are no marks.
class EventLegendWidget final : public QWidget {
  Q_OBJECT

 public:
  explicit EventLegendWidget(QWidget* parent);

  void setLegend(const EventLegend& legend);
  const EventLegend& legend() const { return _legend; }

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;

 private:
  void fit();

  EventLegend _legend;
};

}  // namespace varnel
