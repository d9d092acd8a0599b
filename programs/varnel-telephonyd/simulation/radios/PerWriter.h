#pragma once

#include "base/Bytes.h"

namespace varnel::simulation {

/// Writes a message of a radio interface bit by bit: the first bit is the highest of the first byte. Such
/// messages are coded as in ITU-T X.691, unaligned: numbers take as many bits as their range needs, an
/// optional part has a bit that tells whether it is there, and a choice has a number.
class PerWriter {
 public:
  PerWriter& bits(unsigned width, std::uint64_t number);
  /// The parts of a sequence that are not there.
  PerWriter& absent(unsigned parts) { return bits(parts, 0); }
  PerWriter& bytes(ByteView bytes);
  /// Bytes behind their number, which is below 128.
  PerWriter& octetString(ByteView bytes);

  /// The message. Bits of 0 fill the last byte. A message has at least one byte.
  Bytes finish() const { return _bytes; }

 private:
  Bytes _bytes;
  unsigned _free = 0;  // bits of the last byte
};

}  // namespace varnel::simulation
