#pragma once

#include <functional>
#include <span>

#include "base/Bytes.h"
#include "host/captures/FramedCapture.h"

namespace varnel {

/// The frames in bytes that come piece by piece.
class FrameStream final {
 public:
  /// Frames that are not sound are counted there, which must outlive the stream.
  explicit FrameStream(LeftOut& leftOut);
  FrameStream(const FrameStream&) = delete;
  FrameStream& operator=(const FrameStream&) = delete;
  ~FrameStream() = default;

  /// Calls the function with the contents of each frame that ends in these bytes. It may change the contents.
  void take(ByteView bytes, const std::function<void(std::span<std::uint8_t> contents)>& takeFrame);
  /// The bytes have ended. They may begin anew after this.
  void end() { _scanner.endStream(); }

 private:
  /// Hands on the bytes that were given to it.
  class GivenBytes;

  GivenBytes* _given;  // of the window
  ByteWindow _window;
  FrameScanner _scanner;
};

}  // namespace varnel
