#pragma once

#include <chrono>
#include <optional>
#include <string>
#include <string_view>

#include "base/Time.h"

namespace varnel {

/// A moment in UTC with milliseconds in the form of RFC 3339: 2024-03-01T14:05:11.500Z. Smaller parts are cut
/// off.
std::string timestamp(Time time);

/// Seconds with three digits behind the point: "12.500".
std::string secondsText(std::chrono::nanoseconds duration);

/// The moment of a default date description (YYYY-MM-DD hh:mm:ss +0000); nothing for any other text.
std::optional<Time> timeOfDescription(std::string_view text);

}  // namespace varnel
