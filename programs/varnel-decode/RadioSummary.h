#pragma once

#include <string>

#include "base/Value.h"

namespace varnel {

/// A line for each radio that the display of all radios shows: the serving cell, its channel and band, how
/// strong it is, and whether the phone is registered. Empty for other displays, and while no radio has told
/// any of this.
std::string radioSummary(const Value& display);

}  // namespace varnel
