#include "programs/shared/TimeTicks.h"

#include <QDateTime>
#include <cmath>

namespace varnel {

namespace {

constexpr double second = 1000, minute = 60 * second, hour = 60 * minute, day = 24 * hour;

// The steps of hours and days divide a day evenly.
constexpr double steps[] = {
    0.1 * second, 0.2 * second, 0.5 * second, second,     2 * second, 5 * second,  10 * second,
    20 * second,  30 * second,  minute,       2 * minute, 5 * minute, 10 * minute, 20 * minute,
    30 * minute,  hour,         2 * hour,     6 * hour,   12 * hour,  day,         2 * day,
    5 * day,      10 * day,     20 * day,     50 * day,   100 * day,  200 * day,   500 * day,
};

double stepFor(double length, int most) {
  for (const double step : steps)
    if (length / step < most) return step;
  double step = 1000 * day;
  while (length / step >= most) step *= 10;
  return step;
}

QString formatFor(double step, bool isOneDay) {
  if (step >= day) return QStringLiteral("yyyy-MM-dd");
  const QString time = step < second   ? QStringLiteral("HH:mm:ss.zzz")
                       : step < minute ? QStringLiteral("HH:mm:ss")
                                       : QStringLiteral("HH:mm");
  return isOneDay ? time : QStringLiteral("MM-dd ") + time;
}

QDateTime utc(double milliseconds) {
  return QDateTime::fromMSecsSinceEpoch(static_cast<qint64>(milliseconds), Qt::UTC);
}

}  // namespace

std::vector<TimeTick> timeTicks(double first, double last, TickLabels labels, double offset, int most) {
  const double step = stepFor(last - first, most);
  const QString format = formatFor(step, utc(first + offset).date() == utc(last + offset).date());
  std::vector<TimeTick> ticks;
  for (double number = std::ceil((first + offset) / step); number * step <= last + offset; ++number) {
    const double moment = number * step;
    const bool isTimeOfDay = labels == TickLabels::TimeOfDay;
    ticks.push_back(
        {moment - offset, isTimeOfDay ? utc(moment).toString(format) : QString::number(moment / second)});
  }
  return ticks;
}

}  // namespace varnel
