#pragma once

#include <optional>
#include <span>

#include "host/captures/Capture.h"

namespace varnel {

/// The stream of a diagnostic port whose frames have a length and no escapes: 7E 01, the length (2), the
/// contents, 7E.
class LengthFramedCapture final : public Capture {
 public:
  explicit LengthFramedCapture(CaptureInput input) : Capture(std::move(input)) {}
  bool next(CaptureRecord& record) override;

 private:
  std::optional<std::span<std::uint8_t>> nextContents();
  void passOver();
};

/// The size of the frame that begins here; 0 when none does; nothing when there are too few bytes to decide.
std::optional<std::size_t> lengthFrameAt(ByteView bytes);

/// The bytes around a frame's contents.
inline constexpr std::size_t lengthFrameHeader = 4, lengthFrameTrailer = 1;

}  // namespace varnel
