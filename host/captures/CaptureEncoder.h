#pragma once

#include <cstdint>

#include "base/Bytes.h"
#include "host/captures/CaptureRecord.h"

namespace varnel {

/// Makes the bytes of a capture, for whoever puts them somewhere: the beginning once, then each record's.
class CaptureEncoder {
 public:
  CaptureEncoder() = default;
  CaptureEncoder(const CaptureEncoder&) = delete;
  CaptureEncoder& operator=(const CaptureEncoder&) = delete;
  virtual ~CaptureEncoder() = default;

  /// What stands before the first record; may be empty.
  virtual ByteView beginning() { return {}; }

  /// The bytes of a record, valid until the next call; empty for a message that has no place in such a
  /// capture, which is then counted.
  virtual ByteView encode(const CaptureRecord& record) = 0;

  /// How many messages were left out so far.
  std::uint64_t leftOut() const { return _leftOut; }

 protected:
  ByteView leaveOut() {
    ++_leftOut;
    return {};
  }

 private:
  std::uint64_t _leftOut = 0;
};

/// Appends the log record in a message of log type 1: without what stands before it, its length its own, its
/// time the modem's. A time in its header that a modem did not put there, such as a server's count of
/// milliseconds, gives way to the record's. False, with nothing appended, for other messages and for those
/// that are longer than a record can be.
bool appendLogRecord(Bytes& bytes, const CaptureRecord& record);

}  // namespace varnel
