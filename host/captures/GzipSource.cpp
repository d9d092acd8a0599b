#include "host/captures/GzipSource.h"

#include <algorithm>
#include <limits>
#include <new>

#include "host/captures/CaptureRecord.h"

namespace varnel {

namespace {

constexpr int gzipOnly = 16 + MAX_WBITS;

uInt zlibSize(std::size_t size) {
  return static_cast<uInt>(std::min<std::size_t>(size, std::numeric_limits<uInt>::max()));
}

}  // namespace

GzipSource::GzipSource(ByteWindow packed, std::string name)
    : _packed(std::move(packed)), _name(std::move(name)) {
  if (::inflateInit2(&_stream, gzipOnly) != Z_OK) throw std::bad_alloc();
}

GzipSource::~GzipSource() { ::inflateEnd(&_stream); }

std::size_t GzipSource::read(std::span<std::uint8_t> room) {
  while (!_isAtEnd) {
    const auto packed = _packed.unread();
    _stream.next_in = packed.data();
    _stream.avail_in = zlibSize(packed.size());
    _stream.next_out = room.data();
    _stream.avail_out = zlibSize(room.size());
    const int status = ::inflate(&_stream, Z_SYNC_FLUSH);
    _packed.drop(static_cast<std::size_t>(_stream.next_in - packed.data()));
    const auto count = static_cast<std::size_t>(_stream.next_out - room.data());
    if (status == Z_STREAM_END) {
      _isAtEnd = !beginsNextPiece();
    } else if (status == Z_MEM_ERROR) {
      throw std::bad_alloc();
    } else if (status != Z_OK && status != Z_BUF_ERROR && count == 0) {
      throw CaptureError(_name + " is damaged: what gzip has packed cannot be unpacked any further");
    }
    if (count > 0) return count;
    if (!_isAtEnd && _packed.unread().empty()) _isAtEnd = !_packed.more();
  }
  return 0;
}

// Like gzip, ignores bytes after a piece that are no piece.
bool GzipSource::beginsNextPiece() {
  if (!_packed.holds(2)) return false;
  const auto packed = _packed.unread();
  return packed[0] == 0x1F && packed[1] == 0x8B && ::inflateReset(&_stream) == Z_OK;
}

}  // namespace varnel
