#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "base/Bytes.h"
#include "host/captures/CaptureRecord.h"

namespace varnel {

/// Makes the bytes of a capture, which the caller writes: the beginning once, then the bytes of each record.
class CaptureEncoder {
 public:
  CaptureEncoder() = default;
  CaptureEncoder(const CaptureEncoder&) = delete;
  CaptureEncoder& operator=(const CaptureEncoder&) = delete;
  virtual ~CaptureEncoder() = default;

  /// The bytes before the first record; may be empty.
  virtual ByteView beginning() { return {}; }

  /// The bytes of a record, valid until the next call. Empty for a message that this form cannot hold; it is
  /// counted.
  virtual ByteView encode(const CaptureRecord& record) = 0;

  /// How many messages were left out so far.
  std::uint64_t leftOut() const { return _leftOut; }

  /// One sentence for users about what the file with this path lacks of the capture; nothing when it is
  /// whole.
  virtual std::optional<std::string> remark(const std::string& captureName, const std::string& path) const;

 protected:
  ByteView leaveOut() {
    ++_leftOut;
    return {};
  }

 private:
  std::uint64_t _leftOut = 0;
};

/// Appends the log record in a message of log type 1, without what is before it. The record gets its own
/// length and the modem's time. If the time in its header is not a modem's, such as a server's count of
/// milliseconds, the capture's time of the record replaces it. Returns false, without appending anything, for
/// other messages and for messages that are longer than a record can be.
bool appendLogRecord(Bytes& bytes, const CaptureRecord& record);

}  // namespace varnel
