#pragma once

#include <string_view>

#include "base/Bytes.h"
#include "base/PropertyList.h"
#include "base/Value.h"

namespace varnel {

/// What a message must cause. This is found out without the generators.
enum class Outcome {
  Accepted,
  UnreadableSimFiles,  ///< LogCode_0xFF0000::UnknownDataException
  NoPropertyList,      ///< AssertionFailure of line 90
  UnknownObject,       ///< AssertionFailure of line 78
};
Outcome requiredOutcome(std::string_view technology, ByteView message);

/// The bytes of an accepted message that belong in the binary log.
ByteView loggedBytes(std::string_view technology, ByteView message);

/// Whether the bytes are a property list within the limits that stands for so many values that working on it
/// takes long. Such inputs would take time from all others. The tests of the limits cover them.
bool isLaborious(ByteView bytes, const PropertyListLimits& limits);

/// Whether a value holds a text that XML cannot hold.
bool holdsTextStrangeToXml(const Value& value);

}  // namespace varnel
