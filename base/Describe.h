#pragma once

#include <string>

#include "base/Value.h"

namespace varnel {

/// A value on one line, for the log. Texts are in quotes, dictionaries look like {State = "Cell DCH"; } with
/// their entries in order, arrays like ("1", "2"). Numbers are decimal, data is its length, and the absent
/// value is (null).
std::string describe(const Value& value);

}  // namespace varnel
