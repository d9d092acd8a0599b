#pragma once

#include <optional>
#include <span>

#include "host/captures/Capture.h"

namespace varnel {

/// Finds the frames of a diagnostic port in its stream: each ends in 0x7E and may begin with one; 0x7D
/// escapes the byte behind it; the last two bytes are a checksum. Frames come in the buffer that they were
/// read into.
class FrameScanner {
 public:
  /// Both outlive the scanner.
  FrameScanner(ByteWindow& bytes, LeftOut& leftOut) : _bytes(bytes), _leftOut(leftOut) {}

  /// The contents of the next sound frame, without its checksum, which the reader may write to; nothing at
  /// the end. What is not sound is counted. Valid until the next call. Throws CaptureError.
  std::optional<std::span<std::uint8_t>> next();

 private:
  std::optional<std::span<std::uint8_t>> nextSegment();
  void endStream();
  void countUnsound();

  ByteWindow& _bytes;
  LeftOut& _leftOut;
  std::size_t _searched = 0;  // of the unread bytes: no frame ends there
  bool _isWithinNoise = false;
  bool _mayBeTorn = true;  // the first frame began before the capture did, unless a frame's end comes before
};

/// The framed stream of a diagnostic port.
class FramedCapture final : public Capture {
 public:
  explicit FramedCapture(CaptureInput input) : Capture(std::move(input)), _frames(bytes(), count()) {}
  bool next(CaptureRecord& record) override;

 private:
  FrameScanner _frames;
};

/// The bytes between two frame ends without their escapes, in their own place; empty when an escape has no
/// byte behind it.
std::span<std::uint8_t> unescaped(std::span<std::uint8_t> segment);

}  // namespace varnel
