#pragma once

#include <optional>
#include <string>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Services.h"

namespace varnel {

/// How displays of a technology write their numbers. When the technology is unknown, as with a snapshot, the
/// formats of all technologies: an entry that two of them show in different units then has no unit.
NumberFormats numberFormatsOf(const std::optional<std::string>& technology,
                              const std::vector<std::string>& technologies, const Services& services);

}  // namespace varnel
