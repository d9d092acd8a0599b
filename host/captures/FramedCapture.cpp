#include "host/captures/FramedCapture.h"

#include <cstring>

#include "host/captures/FrameChecksum.h"
#include "host/captures/LogFrame.h"

namespace varnel {

namespace {

constexpr std::uint8_t frameEnd = 0x7E;
constexpr std::uint8_t escape = 0x7D;
constexpr std::uint8_t escapeBit = 0x20;
constexpr std::size_t checksumSize = 2;
constexpr std::size_t smallestSegment = checksumSize + 1;
// Every byte may have an escape.
constexpr std::size_t longestSegment = 2 * (longestContents + checksumSize);

std::uint8_t* find(std::uint8_t wanted, std::uint8_t* begin, const std::uint8_t* end) {
  if (begin == end) return nullptr;  // there may be no bytes to look at
  return static_cast<std::uint8_t*>(std::memchr(begin, wanted, static_cast<std::size_t>(end - begin)));
}

}  // namespace

std::span<std::uint8_t> unescaped(std::span<std::uint8_t> segment) {
  std::uint8_t* const end = segment.data() + segment.size();
  std::uint8_t* from = find(escape, segment.data(), end);
  if (!from) return segment;
  std::uint8_t* to = from;
  while (from) {
    if (end - from < 2) return {};
    *to++ = from[1] ^ escapeBit;
    from += 2;
    std::uint8_t* const nextEscape = find(escape, from, end);
    const auto plain = static_cast<std::size_t>((nextEscape ? nextEscape : end) - from);
    std::memmove(to, from, plain);
    to += plain;
    from = nextEscape;
  }
  return segment.first(static_cast<std::size_t>(to - segment.data()));
}

std::optional<std::span<std::uint8_t>> FrameScanner::next() {
  for (;;) {
    if (const auto contents = nextAtHand()) return contents;
    if (_bytes.more()) continue;
    endStream();
    return std::nullopt;
  }
}

std::optional<std::span<std::uint8_t>> FrameScanner::nextAtHand() {
  while (const auto segment = nextSegment()) {
    const std::span<std::uint8_t> frame = unescaped(*segment);
    if (frame.size() >= smallestSegment && isSound(frame)) {
      _mayBeTorn = false;
      return frame.first(frame.size() - checksumSize);
    }
    countUnsound();
  }
  return std::nullopt;
}

// The bytes between two frame ends, if their number fits a frame; nothing when more must be read.
std::optional<std::span<std::uint8_t>> FrameScanner::nextSegment() {
  for (;;) {
    const auto unread = _bytes.unread();
    const auto* const end = find(frameEnd, unread.data() + _searched, unread.data() + unread.size());
    if (!end) {
      _searched = unread.size();
      if (_searched > longestSegment || _isWithinNoise) {
        _leftOut.noiseBytes += _searched;
        _bytes.drop(_searched);
        _searched = 0;
        _isWithinNoise = true;
      }
      return std::nullopt;
    }
    const auto length = static_cast<std::size_t>(end - unread.data());
    _bytes.drop(length + 1);
    _searched = 0;
    const bool mayBeFrame = !_isWithinNoise && length >= smallestSegment && length <= longestSegment;
    if (mayBeFrame) return unread.first(length);
    _leftOut.noiseBytes += length;
    _isWithinNoise = false;
    _mayBeTorn = false;
  }
}

void FrameScanner::endStream() {
  const std::size_t rest = _bytes.unread().size();
  if (rest > 0) ++_leftOut.torn;
  _bytes.drop(rest);
  _searched = 0;
  _isWithinNoise = false;
  _mayBeTorn = true;
}

void FrameScanner::countUnsound() {
  ++(_mayBeTorn ? _leftOut.torn : _leftOut.badChecksum);
  _mayBeTorn = false;
}

bool FramedCapture::next(CaptureRecord& record) {
  while (const auto contents = _frames.next()) {
    if (takeLogFrame(*contents, record, count())) return true;
  }
  return false;
}

}  // namespace varnel
