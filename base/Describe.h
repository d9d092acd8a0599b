#pragma once

#include <string>

#include "base/Value.h"

namespace varnel {

/// A value on one line, for the log: texts in quotes, dictionaries as {State = "Cell DCH"; } with every entry
/// in its order, arrays as ("1", "2"), numbers in decimal, data as its length; the absent value as (null).
std::string describe(const Value& value);

}  // namespace varnel
