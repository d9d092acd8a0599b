#include "host/captures/ByteWindow.h"

#include <algorithm>
#include <cstring>

namespace varnel {

namespace {

// Large enough that a read costs little compared with the work on its bytes, and small enough for the cache.
// A small capture ends before its size matters.
constexpr std::size_t usual = 1 << 18, first = 1 << 14;

}  // namespace

bool ByteWindow::more() {
  if (_isAtEnd) return false;
  makeRoom();
  const std::size_t count = _source->read(std::span(_bytes).subspan(_end));
  _end += count;
  _isAtEnd = count == 0;
  return !_isAtEnd;
}

bool ByteWindow::skip(std::uint64_t count) {
  for (;;) {
    const std::size_t now = static_cast<std::size_t>(std::min<std::uint64_t>(count, _end - _begin));
    drop(now);
    count -= now;
    if (count == 0) return true;
    if (!more()) return false;
  }
}

void ByteWindow::makeRoom() {
  const std::size_t size = bytesRead() < first ? first : usual, leastRoom = size / 4;
  if (_bytes.size() < size) _bytes.resize(size);
  if (_bytes.size() - _end >= leastRoom) return;
  std::memmove(_bytes.data() + headroom, _bytes.data() + _begin, _end - _begin);
  _end -= _begin - headroom;
  _begin = headroom;
  if (_bytes.size() - _end < leastRoom) _bytes.resize(_bytes.size() * 2);
}

}  // namespace varnel
