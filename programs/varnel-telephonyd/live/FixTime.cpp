#include "programs/varnel-telephonyd/live/FixTime.h"

#include <QString>
#include <QTime>
#include <QTimeZone>
#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>

namespace varnel {

namespace {

// "203015", with any number of digits after a point.
std::optional<QTime> timeOfDay(const std::string& text) {
  constexpr std::size_t wholeDigits = 6, mostDigits = 16;
  const auto isDigit = [](char letter) { return letter >= '0' && letter <= '9'; };
  const auto digits = std::ranges::count_if(text, isDigit);
  const bool hasPoint = text.size() > wholeDigits && text[wholeDigits] == '.';
  if (text.size() < wholeDigits || text.size() > mostDigits) return std::nullopt;
  if (static_cast<std::size_t>(digits) + (hasPoint ? 1 : 0) != text.size()) return std::nullopt;
  if (!hasPoint && text.size() != wholeDigits) return std::nullopt;
  const QString whole = QString::fromStdString(text.substr(0, wholeDigits));
  const QTime time = QTime::fromString(whole, QStringLiteral("HHmmss"));
  if (!time.isValid()) return std::nullopt;
  // A time of day has no more than milliseconds here.
  const double fraction = hasPoint ? std::stod("0" + text.substr(wholeDigits)) : 0;
  return time.addMSecs(static_cast<int>(std::floor(fraction * 1000)));
}

}  // namespace

std::optional<Date> dateOf(const QDateTime& moment) {
  // Property lists count seconds from 2001.
  constexpr std::int64_t secondsUntil2001 = 978'307'200;
  if (!moment.isValid()) return std::nullopt;
  const std::int64_t milliseconds = moment.toMSecsSinceEpoch() - secondsUntil2001 * 1000;
  if (milliseconds < 0 || milliseconds / 1000 > std::numeric_limits<std::int32_t>::max()) return std::nullopt;
  return Date{static_cast<std::int32_t>(milliseconds / 1000),
              static_cast<std::int32_t>(milliseconds % 1000 * 1000)};
}

std::optional<Date> dateOfFix(const std::string& text, const QDateTime& now) {
  if (const auto time = timeOfDay(text)) {
    constexpr std::int64_t halfDay_s = 43'200;
    QDateTime moment(now.toUTC().date(), *time, Qt::UTC);
    if (now.secsTo(moment) > halfDay_s) moment = moment.addDays(-1);
    if (moment.secsTo(now) > halfDay_s) moment = moment.addDays(1);
    return dateOf(moment);
  }
  if (text.find('T') == std::string::npos) return std::nullopt;
  QDateTime moment = QDateTime::fromString(QString::fromStdString(text), Qt::ISODateWithMs);
  // Without an offset it is UTC, too.
  if (moment.timeSpec() == Qt::LocalTime) moment.setTimeSpec(Qt::UTC);
  return dateOf(moment);
}

}  // namespace varnel
