#pragma once

#include "base/Value.h"

namespace varnel {

/// A value whose texts and keys an XML property list can hold: what it cannot of them is U+FFFD. Containers
/// in which nothing has to be replaced are those of the value, which stays as it is. Keys that would become
/// the same get the number of their entry behind them. The absent value comes of what is larger than a file
/// may be.
Value fitForXml(const Value& value);

}  // namespace varnel
