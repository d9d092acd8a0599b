#pragma once

#include "base/Value.h"

namespace varnel {

/// The value with texts and keys that an XML property list can hold: U+FFFD replaces each character that it
/// cannot hold. The given value does not change. The result shares each container in which nothing had to be
/// replaced. When two keys would become the same, the number of its entry is added to the later one. Yields
/// the absent value when the value is larger than a file may be.
Value fitForXml(const Value& value);

}  // namespace varnel
