#pragma once

#include <memory>
#include <optional>
#include <string>

#include "base/Bytes.h"
#include "base/Time.h"
#include "host/RecordingFile.h"
#include "host/captures/CaptureEncoder.h"

namespace varnel {

/// Writes messages to a capture of link type USER0 (147) with nanoseconds. The file is a `RecordingFile`:
/// pcapng when a technology is given, which the file then names, else pcap. What was written is in the file
/// when the call returns.
class CaptureWriter {
 public:
  /// "-" is standard output. Throws as `RecordingFile` does.
  explicit CaptureWriter(const std::string& path, ExistingRecording existing = ExistingRecording::Refused,
                         const std::optional<std::string>& technology = {});

  /// Throws std::runtime_error when the message cannot be written; what was written before is in the file.
  /// pcap keeps 32 bits of the seconds.
  void write(Time time, ByteView message);

 private:
  RecordingFile _file;
  std::unique_ptr<CaptureEncoder> _encoder;
  bool _hasHeader = false;
};

}  // namespace varnel
