#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

#include "base/Bytes.h"

namespace varnel {

/// What a frame means to its receiver.
enum class FrameMark : std::uint8_t {
  Message = 0,       ///< a message that wants no reply
  Request = 1,       ///< a message that awaits its reply
  Reply = 2,         ///< the reply to the oldest request that has none yet
  Notification = 3,  ///< sent without a request, to every client
  NoReply = 4,       ///< there will be no reply to the oldest request without one
};

/// The largest payload, in bytes.
inline constexpr std::size_t maximumPayload = 1 << 20;

/// What a local socket carries in one piece: length of the payload (u32), message identifier (i32), mark
/// (u8), payload. Numbers are little-endian.
struct Frame {
  std::int32_t identifier;
  FrameMark mark;
  ByteView payload;  ///< at most `maximumPayload` bytes
};

/// Appends the frame's bytes.
void appendFrame(Bytes& bytes, const Frame& frame);

/// Finds the frames in bytes that arrive in pieces of any size.
class FrameReader {
 public:
  /// Takes the next bytes. If the caller takes all frames out before it feeds again, the reader keeps at most
  /// one unfinished frame.
  void feed(ByteView bytes);
  /// The next whole frame; nothing when it has not arrived yet. The payload is valid until the next call.
  std::optional<Frame> next();
  /// True once a length or a mark was found that no frame has. The rest cannot be understood: there are no
  /// more frames, and the reader drops all bytes.
  bool isFaulty() const { return _isFaulty; }
  /// True while a part of a frame has arrived. Call it after `next` has returned nothing.
  bool hasUnfinishedFrame() const { return _bytes.size() > _taken; }

 private:
  void giveUp();

  Bytes _bytes;
  std::size_t _taken = 0;  // bytes at the front that belong to frames already taken out
  bool _isFaulty = false;
};

}  // namespace varnel
