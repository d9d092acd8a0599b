#include "programs/varnel-telephonyd/sources/FrameStream.h"

#include <algorithm>
#include <memory>
#include <optional>

namespace varnel {

class FrameStream::GivenBytes final : public ByteSource {
 public:
  void give(ByteView bytes) { _bytes = bytes; }
  bool isEmpty() const { return _bytes.empty(); }

  std::size_t read(std::span<std::uint8_t> room) override {
    const std::size_t count = std::min(room.size(), _bytes.size());
    std::copy_n(_bytes.begin(), count, room.begin());
    _bytes = _bytes.subspan(count);
    _bytesRead += count;
    return count;
  }
  std::uint64_t bytesRead() const override { return _bytesRead; }
  std::optional<std::uint64_t> fileSize() const override { return std::nullopt; }

 private:
  ByteView _bytes;
  std::uint64_t _bytesRead = 0;
};

FrameStream::FrameStream(LeftOut& leftOut)
    : _given(new GivenBytes), _window(std::unique_ptr<ByteSource>(_given)), _scanner(_window, leftOut) {}

void FrameStream::take(ByteView bytes,
                       const std::function<void(std::span<std::uint8_t> contents)>& takeFrame) {
  _given->give(bytes);
  while (!_given->isEmpty()) {
    _window.more();
    while (const auto contents = _scanner.nextAtHand()) takeFrame(*contents);
  }
}

}  // namespace varnel
