#pragma once

#include <string>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Services.h"

namespace varnel {

/// How displays of these technologies write their numbers. An entry that two of them show in different units
/// has no unit.
NumberFormats numberFormatsOf(const std::vector<std::string>& technologies, const Services& services);

}  // namespace varnel
