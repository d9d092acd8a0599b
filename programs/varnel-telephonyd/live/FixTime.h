#pragma once

#include <QDateTime>
#include <optional>
#include <string>

#include "base/Value.h"

namespace varnel {

/// The moment as property lists have it; absent for one that is not valid, or before 2001, or after 2069.
std::optional<Date> dateOf(const QDateTime& moment);

/// The moment of a fix from a receiver's own text: a date and time of ISO 8601, or a time of day in UTC such
/// as "203015" or "203015.25". A time of day is the one that is nearest to `now`. Absent for another text.
std::optional<Date> dateOfFix(const std::string& text, const QDateTime& now);

}  // namespace varnel
