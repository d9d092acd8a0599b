#pragma once

#include <string>

#include "base/Bytes.h"
#include "base/Time.h"
#include "host/RecordingFile.h"

namespace varnel {

/// Writes messages to a pcap file of link type USER0 (147) with nanoseconds, a `RecordingFile`. What was
/// written is in the file when the call returns.
class CaptureWriter {
 public:
  /// "-" is standard output. Throws as `RecordingFile` does.
  explicit CaptureWriter(const std::string& path, ExistingRecording existing = ExistingRecording::Refused)
      : _file(path, existing) {}

  /// Throws std::runtime_error when the message cannot be written; what was written before is in the file.
  /// Seconds are kept as 32 bits.
  void write(Time time, ByteView message);

 private:
  RecordingFile _file;
  bool _hasHeader = false;
};

}  // namespace varnel
