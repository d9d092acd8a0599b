#include "programs/varnel-telephonyd/sources/PortSource.h"

namespace varnel {

std::optional<StreamMessage> PortSource::next() {
  if (_messages.empty()) return std::nullopt;
  StreamMessage message = std::move(_messages.front());
  _messages.pop_front();
  _size -= message.bytes.size() + costOfMessage;
  return message;
}

void PortSource::push(std::chrono::milliseconds uptime, ByteView message) {
  const std::size_t size = message.size() + costOfMessage;
  if (size > mostWaiting - _size) {
    ++_lost;
    return;
  }
  _size += size;
  _messages.push_back({uptime - _startedAt, Bytes(message.begin(), message.end())});
}

}  // namespace varnel
