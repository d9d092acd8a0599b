#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

#include "base/Bytes.h"

namespace varnel {

/// What a frame is to its receiver.
enum class FrameMark : std::uint8_t {
  Message = 0,       ///< a message that wants no reply
  Request = 1,       ///< a message that awaits its reply
  Reply = 2,         ///< the reply to the oldest request that has none yet
  Notification = 3,  ///< sent unasked, to whom it may concern
  NoReply = 4,       ///< the oldest request without a reply will get none
};

/// The bytes of a payload at most.
inline constexpr std::size_t maximumPayload = 1 << 20;

/// What goes over a local socket in one piece: length of the payload (u32), message identifier (i32), mark
/// (u8), payload; numbers are little-endian.
struct Frame {
  std::int32_t identifier;
  FrameMark mark;
  ByteView payload;  ///< `maximumPayload` bytes at most
};

/// Puts the frame's bytes at the end of the given ones.
void appendFrame(Bytes& bytes, const Frame& frame);

/// Finds the frames in bytes that arrive in pieces of any size.
class FrameReader {
 public:
  /// Takes the bytes that follow. When all frames are taken out before the next feeding, one unfinished frame
  /// is all that is kept.
  void feed(ByteView bytes);
  /// The next whole frame; nothing when it has yet to arrive. Its payload is good until the next call.
  std::optional<Frame> next();
  /// True once a length or a mark has been met that no frame has. What follows cannot be understood: there
  /// are no more frames, and bytes are dropped.
  bool isFaulty() const { return _isFaulty; }
  /// True while some but not all bytes of a frame have arrived, once `next` has returned nothing.
  bool hasUnfinishedFrame() const { return _bytes.size() > _taken; }

 private:
  void giveUp();

  Bytes _bytes;
  std::size_t _taken = 0;  // bytes at the front that belong to frames taken out
  bool _isFaulty = false;
};

}  // namespace varnel
