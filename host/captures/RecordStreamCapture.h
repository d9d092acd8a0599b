#pragma once

#include "host/captures/Capture.h"

namespace varnel {

/// Log records end to end: length (2), code (2), time (8), payload. Nothing marks where a record begins. So a
/// record with an impossible length ends the capture, and the rest is counted as noise.
class RecordStreamCapture final : public Capture {
 public:
  explicit RecordStreamCapture(CaptureInput input) : Capture(std::move(input)) {}
  bool next(CaptureRecord& record) override;

 private:
  void leaveOutTheRest();
};

}  // namespace varnel
