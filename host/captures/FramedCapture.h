#pragma once

#include <optional>
#include <span>

#include "host/captures/Capture.h"

namespace varnel {

/// Finds the frames in the stream of a diagnostic port. Each ends in 0x7E and may begin with one. 0x7D
/// escapes the next byte. The last two bytes are a checksum. Frames are in the buffer into which they were
/// read.
class FrameScanner {
 public:
  /// Both must outlive the scanner.
  FrameScanner(ByteWindow& bytes, LeftOut& leftOut) : _bytes(bytes), _leftOut(leftOut) {}

  /// The contents of the next sound frame, without its checksum; nothing at the end. The caller may change
  /// the bytes. Frames that are not sound are counted. Valid until the next call. Throws CaptureError.
  std::optional<std::span<std::uint8_t>> next();
  /// The same among the bytes that were read already; nothing when no more frames end in them.
  std::optional<std::span<std::uint8_t>> nextAtHand();
  /// Counts what was read after the last frame end as a torn frame. The stream may begin anew after this.
  void endStream();

 private:
  std::optional<std::span<std::uint8_t>> nextSegment();
  void countUnsound();

  ByteWindow& _bytes;
  LeftOut& _leftOut;
  std::size_t _searched = 0;  // no frame ends in this many unread bytes
  bool _isWithinNoise = false;
  bool _mayBeTorn = true;  // the first frame began before the capture, unless a frame end comes first
};

/// The framed stream of a diagnostic port.
class FramedCapture final : public Capture {
 public:
  explicit FramedCapture(CaptureInput input) : Capture(std::move(input)), _frames(bytes(), count()) {}
  bool next(CaptureRecord& record) override;

 private:
  FrameScanner _frames;
};

/// Removes the escapes of the bytes between two frame ends, in place. Empty when an escape is the last byte.
std::span<std::uint8_t> unescaped(std::span<std::uint8_t> segment);

}  // namespace varnel
