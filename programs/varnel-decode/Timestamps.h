#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "base/Time.h"

namespace varnel {

/// A moment in UTC with milliseconds, as RFC 3339 has it: 2024-03-01T14:05:11.500Z. What is finer is cut off.
std::string timestamp(Time time);

/// The moment that a default date description (YYYY-MM-DD hh:mm:ss +0000) tells; nothing for any other text.
std::optional<Time> timeOfDescription(std::string_view text);

}  // namespace varnel
