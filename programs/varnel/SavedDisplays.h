#pragma once

#include <optional>
#include <string>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Services.h"
#include "programs/shared/Generation.h"

namespace varnel {

/// The displays of the snapshot at this path, the oldest first; nothing when the file is no snapshot. Throws
/// std::runtime_error, one sentence, when it cannot be read, or has no display.
std::optional<std::vector<Generation>> savedDisplays(const std::string& path);

/// How a display writes its numbers. A snapshot does not name its technology: this takes the one that knows
/// most of the numbers in the display.
NumberFormats formatsOfSaved(const Value& display, const Services& services);

/// The status for a display that was saved at this time.
std::string statusOfSaved(Time time);

}  // namespace varnel
