#include "programs/varnel/trends/TrendData.h"

#include <QDateTime>
#include <algorithm>

namespace varnel {

namespace {

double clockMilliseconds(const Time& time) {
  return static_cast<double>(time.seconds) * 1000 + time.nanoseconds * 1e-6;
}

QString dayOf(const TrendSource::Moment& moment) {
  return QDateTime::fromSecsSinceEpoch(moment.time.seconds, Qt::OffsetFromUTC, moment.offsetSeconds)
      .toString(QStringLiteral("yyyy-MM-dd"));
}

void addTicks(TrendData& data, const TrendSource& source, const TrendRoom& room) {
  const auto clock = source.clockName();
  const double first = millisecondsOf(data.stretch.begin), last = millisecondsOf(data.stretch.end);
  if (!clock) {
    data.ticks = timeTicks(first, last, TickLabels::Seconds, 0, room.ticks);
    data.axisTitle = QObject::tr("Seconds since the start");
    return;
  }
  const auto pieces = source.clockPieces(data.stretch);
  for (const auto& piece : pieces) {
    const double begin = millisecondsOf(piece.stretch.begin), end = millisecondsOf(piece.stretch.end);
    if (&piece != &pieces.front()) data.clockSets.push_back(begin);
    const double clockMinusAxis = clockMilliseconds(piece.time) - begin;
    const double offset = source.momentAt(piece.stretch.begin).offsetSeconds * 1000.0;
    const int most = std::max(2, static_cast<int>(room.ticks * (end - begin) / std::max(last - first, 1.0)));
    for (TimeTick tick :
         timeTicks(begin + clockMinusAxis, end + clockMinusAxis, TickLabels::TimeOfDay, offset, most)) {
      tick.milliseconds -= clockMinusAxis;
      data.ticks.push_back(tick);
    }
  }
  const QString begin = dayOf(source.momentAt(data.stretch.begin)),
                end = dayOf(source.momentAt(data.stretch.end));
  data.axisTitle = begin == end ? begin : QObject::tr("%1 to %2").arg(begin, end);
  data.axisTitle += QStringLiteral(", ") + QString::fromStdString(*clock);
}

}  // namespace

double millisecondsOf(TrendSource::Duration duration) { return static_cast<double>(duration.count()) * 1e-6; }

TrendData trendData(const TrendSource& source, const std::vector<std::string>& keys,
                    const TrendSource::Stretch& stretch, const TrendRoom& room) {
  TrendData data;
  data.stretch = stretch;
  for (const std::string& key : keys) {
    TrendRow row = source.row(key).value_or(TrendRow{key, {}, {}, {}});
    data.lines.push_back(
        {std::move(row), source.summary(key, stretch), source.columns(key, stretch, room.columns)});
  }
  data.events = source.events(stretch);
  data.playing = source.playingPosition();
  addTicks(data, source, room);
  return data;
}

QString momentText(const TrendSource& source, TrendSource::Duration point) {
  if (!source.clockName())
    return QObject::tr("%1 s").arg(std::chrono::duration<double>(point).count(), 0, 'f', 1);
  const auto moment = source.momentAt(point);
  constexpr int nanosecondsPerTenth = 100'000'000;
  const QString text =
      QDateTime::fromSecsSinceEpoch(moment.time.seconds, Qt::OffsetFromUTC, moment.offsetSeconds)
          .toString(QStringLiteral("yyyy-MM-dd HH:mm:ss"));
  return text + QLatin1Char('.') + QString::number(moment.time.nanoseconds / nanosecondsPerTenth);
}

QString legendText(const TrendRow& row) {
  if (row.name.empty()) return QObject::tr("(gone) %1").arg(QString::fromStdString(row.key));
  QString text = QString::fromStdString(row.name);
  if (!row.unit.empty()) text += QStringLiteral(" (%1)").arg(QString::fromStdString(row.unit));
  if (!row.place.empty()) text += QStringLiteral(" — ") + QString::fromStdString(row.place);
  return text;
}

}  // namespace varnel
