#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <vector>

#include "host/captures/ByteSource.h"

namespace varnel {

/// The unread bytes of a source in one piece, which grows on demand. The caller says how many bytes it needs
/// at most, so memory stays as small as the largest thing that is looked at as a whole.
class ByteWindow {
 public:
  /// The reader may write this many bytes before the unread bytes, to put something in front of them.
  static constexpr std::size_t headroom = 4;

  explicit ByteWindow(std::unique_ptr<ByteSource> source) : _source(std::move(source)) {}

  /// The reader may change the bytes. Valid until more are read.
  std::span<std::uint8_t> unread() { return {_bytes.data() + _begin, _end - _begin}; }

  /// Marks the bytes as read. They stay valid until more are read.
  void drop(std::size_t count) { _begin += count; }

  /// Reads once from the source; false at the end. Throws CaptureError.
  bool more();

  /// Reads until this many bytes are unread; false when there are fewer. Throws CaptureError.
  bool holds(std::size_t count) {
    while (_end - _begin < count) {
      if (!more()) return false;
    }
    return true;
  }

  /// Drops this many bytes, also those that have not been read yet; false when the end comes first. Throws
  /// CaptureError.
  bool skip(std::uint64_t count);

  std::uint64_t bytesRead() const { return _source->bytesRead(); }
  std::optional<std::uint64_t> fileSize() const { return _source->fileSize(); }

 private:
  void makeRoom();

  std::unique_ptr<ByteSource> _source;
  std::vector<std::uint8_t> _bytes = std::vector<std::uint8_t>(headroom);
  std::size_t _begin = headroom, _end = headroom;
  bool _isAtEnd = false;
};

}  // namespace varnel
