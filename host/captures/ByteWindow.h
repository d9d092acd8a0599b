#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <vector>

#include "host/captures/ByteSource.h"

namespace varnel {

/// The unread bytes of a source in one piece, which grows on demand. Whoever asks for more says how much he
/// wants at the most, so memory stays as small as the largest thing that is looked at whole.
class ByteWindow {
 public:
  /// So many bytes before the unread ones belong to the reader, who may put there what is to stand before.
  static constexpr std::size_t headroom = 4;

  explicit ByteWindow(std::unique_ptr<ByteSource> source) : _source(std::move(source)) {}

  /// The reader may write to them: they are his alone. Valid until more are read.
  std::span<std::uint8_t> unread() { return {_bytes.data() + _begin, _end - _begin}; }

  /// Those bytes have been read. They stay valid until more are.
  void drop(std::size_t count) { _begin += count; }

  /// Reads what there is next, once; false at the end. Throws CaptureError.
  bool more();

  /// Reads until that many are unread; false when there are fewer. Throws CaptureError.
  bool holds(std::size_t count) {
    while (_end - _begin < count) {
      if (!more()) return false;
    }
    return true;
  }

  /// Drops that many, which need not be there yet; false when the end comes before. Throws CaptureError.
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
