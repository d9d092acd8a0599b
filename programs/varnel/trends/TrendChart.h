#pragma once

#include <QCategoryAxis>
#include <QChart>
#include <QLineSeries>
#include <QValueAxis>
#include <string>
#include <vector>

#include "programs/varnel/trends/TrendData.h"
#include "programs/varnel/trends/TrendLines.h"
#include "programs/varnel/trends/TrendLook.h"

namespace varnel {

/// A picture of courses: an axis of time, an axis of values per unit, and the lines.
class TrendChart final : public QChart {
 public:
  TrendChart();

  void setLook(const TrendLook& look);
  /// Shows the data, which must live until the next call.
  void show(const TrendData& data);

  TrendLines& lines() { return *_lines; }
  /// How many labels of times have room side by side.
  int mostTicks() const;

 private:
  struct UnitAxis {
    std::string unit;
    QValueAxis* axis;
    QLineSeries* carrier;  // has no points; an axis needs a series, and those of one series have one range
    TrendScale scale;
    QColor ink;
  };

  void showUnits(const TrendData& data);
  void showTimes(const TrendData& data);
  void showTicks(const std::vector<TimeTick>& ticks);
  UnitAxis& axisOf(const std::string& unit);
  void color(QAbstractAxis& axis, const QColor& ink) const;
  QColor inkOf(const TrendData& data, const std::string& unit) const;

  TrendLook _look;
  QCategoryAxis* _time;
  QLineSeries* _carrier;         // of the axis of time, when there is no row
  std::vector<TimeTick> _ticks;  // that the axis of time has
  std::vector<UnitAxis> _units;
  TrendLines* _lines;
};

}  // namespace varnel
