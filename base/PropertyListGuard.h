#pragma once

#include <cstddef>

#include "base/Bytes.h"
#include "base/PropertyList.h"

namespace varnel {

/// The rest of a limited amount.
class Allowance {
 public:
  explicit Allowance(std::size_t amount) : _left(amount) {}
  /// False, without taking anything, when less than the amount is left.
  bool take(std::size_t amount) {
    if (amount > _left) return false;
    _left -= amount;
    return true;
  }

 private:
  std::size_t _left;
};

/// True for bytes that begin as a binary property list does.
bool isBinaryPropertyList(ByteView bytes);

/// True when the bytes are within the limits and hold nothing that the parser must not see. The parser finds
/// all other errors. Takes time in proportion to the bytes, the expanded nodes, and the expanded bytes.
bool isSafeToParse(ByteView bytes, const PropertyListLimits& limits);

}  // namespace varnel
