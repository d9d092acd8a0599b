#pragma once

#include "host/captures/CaptureEncoder.h"

namespace varnel {

/// The framed stream of a diagnostic port, one frame per record. A record with a subscription is in a
/// wrapper. Holds only messages of log type 1.
class FramedWriter final : public CaptureEncoder {
 public:
  ByteView encode(const CaptureRecord& record) override;

 private:
  Bytes _contents, _frame;
};

/// Log records end to end. Holds only messages of log type 1, and not their subscriptions.
class RecordStreamWriter final : public CaptureEncoder {
 public:
  ByteView encode(const CaptureRecord& record) override;

 private:
  Bytes _record;
};

}  // namespace varnel
