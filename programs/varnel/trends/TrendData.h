#pragma once

#include <QString>
#include <optional>
#include <string>
#include <vector>

#include "programs/shared/TimeTicks.h"
#include "programs/varnel/trends/TrendSource.h"

namespace varnel {

/// What a picture shows at one moment.
struct TrendData {
  struct Line {
    TrendRow row;
    ValueHistory::Summary summary;
    std::vector<ValueHistory::Column> columns;
  };

  TrendSource::Stretch stretch;
  std::vector<Line> lines;
  std::vector<TrendSource::Event> events;
  std::vector<TimeTick> ticks;    ///< in milliseconds of the axis; labels may repeat where the clock was set
  std::vector<double> clockSets;  ///< where the clock was set, in milliseconds of the axis
  QString axisTitle;
  std::optional<TrendSource::Duration> playing;
};

/// How much room there is for it.
struct TrendRoom {
  std::size_t columns = 1;
  int ticks = 8;
};

/// The data of these rows. A row that has gone has a line without a name or values.
TrendData trendData(const TrendSource& source, const std::vector<std::string>& keys,
                    const TrendSource::Stretch& stretch, const TrendRoom& room);

/// A moment in words: date and time, with milliseconds if these differ from 0, or seconds since the start.
QString momentText(const TrendSource& source, TrendSource::Duration point);

double millisecondsOf(TrendSource::Duration duration);

/// The row in words for a legend: its name, its unit, and its place.
QString legendText(const TrendRow& row);

}  // namespace varnel
