#pragma once

#include "host/captures/Capture.h"

namespace varnel {

/// Log records end to end: length (2), code (2), time (8), payload. Nothing marks where one begins, so the
/// first whose length cannot be ends the capture; what follows is counted as noise.
class RecordStreamCapture final : public Capture {
 public:
  explicit RecordStreamCapture(CaptureInput input) : Capture(std::move(input)) {}
  bool next(CaptureRecord& record) override;

 private:
  void leaveOutTheRest();
};

}  // namespace varnel
