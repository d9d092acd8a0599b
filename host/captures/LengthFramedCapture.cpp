#include "host/captures/LengthFramedCapture.h"

#include <algorithm>

#include "host/captures/LittleEndian.h"
#include "host/captures/LogFrame.h"

namespace varnel {

namespace {

constexpr std::uint8_t mark = 0x7E, version = 0x01;

}  // namespace

std::optional<std::size_t> lengthFrameAt(ByteView bytes) {
  const std::uint8_t begin[] = {mark, version};
  if (!std::equal(bytes.begin(),
                  bytes.begin() + static_cast<std::ptrdiff_t>(std::min<std::size_t>(bytes.size(), 2)), begin))
    return 0;
  if (bytes.size() < lengthFrameHeader) return std::nullopt;
  const std::size_t end = lengthFrameHeader + loadLittleEndian<std::uint16_t>(bytes, 2);
  if (bytes.size() <= end) return std::nullopt;
  return bytes[end] == mark ? end + lengthFrameTrailer : 0;
}

bool LengthFramedCapture::next(CaptureRecord& record) {
  while (const auto contents = nextContents()) {
    if (takeLogFrame(*contents, record, count())) return true;
  }
  return false;
}

std::optional<std::span<std::uint8_t>> LengthFramedCapture::nextContents() {
  bool isTorn = false;
  for (;;) {
    const auto unread = bytes().unread();
    const auto size = lengthFrameAt(unread);
    if (size.value_or(0) > 0) {
      bytes().drop(*size);
      return unread.subspan(lengthFrameHeader, *size - lengthFrameHeader - lengthFrameTrailer);
    }
    if (!size && bytes().more()) continue;
    if (bytes().unread().empty()) return std::nullopt;
    // A torn frame counts once, however many bytes come before the next frame.
    if (!isTorn) ++count().torn;
    isTorn = true;
    passOver();
  }
}

// Skips to where the next frame may begin.
void LengthFramedCapture::passOver() {
  const auto unread = bytes().unread().subspan(1);
  const auto next = std::ranges::find(unread, mark);
  bytes().drop(1 + static_cast<std::size_t>(next - unread.begin()));
}

}  // namespace varnel
