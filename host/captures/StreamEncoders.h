#pragma once

#include "host/captures/CaptureEncoder.h"

namespace varnel {

/// The framed stream of a diagnostic port, each record in a frame, in the wrapper where it has a
/// subscription. It has a place for messages of log type 1 alone.
class FramedWriter final : public CaptureEncoder {
 public:
  ByteView encode(const CaptureRecord& record) override;

 private:
  Bytes _contents, _frame;
};

/// Log records end to end. It has a place for messages of log type 1 alone, and none for their subscriptions.
class RecordStreamWriter final : public CaptureEncoder {
 public:
  ByteView encode(const CaptureRecord& record) override;

 private:
  Bytes _record;
};

}  // namespace varnel
