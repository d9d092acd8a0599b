#include "programs/varnel-telephonyd/sources/PortSearch.h"

#include <utility>

#include "programs/varnel-telephonyd/sources/PortTrouble.h"

namespace varnel {

void PortSearch::askNext() {
  while (_next < _setup.candidates.size()) {
    _path = _setup.candidates[_next++];
    auto trouble = _setup.prepare(_path);
    if (!trouble) trouble = open(_path);
    if (!trouble) return;
    _setup.tell(*trouble);
  }
  _setup.ended(std::nullopt);
}

// One sentence when the device cannot be opened.
std::optional<std::string> PortSearch::open(const std::string& path) {
  _device = _setup.makeDevice(path);
  const auto take = [this](ByteView bytes) {
    _reads.take(bytes, [this](ByteView stream) { _session->take(stream); });
  };
  auto trouble =
      _device->open({.bytesCame = take, .wentAway = [this, path] { goOn(troubleOfUnplugged(path)); }});
  if (trouble) return trouble;
  _reads.begin(_device->isSerialLine() ? DeviceReads::Device::SerialLine : DeviceReads::Device::Other);
  _session = std::make_unique<PortSession>(PortSession::Setup{
      .queue = _setup.queue,
      .send = [this](ByteView bytes) { _device->send(bytes); },
      .record = [](const CaptureRecord&) {},
      .ready = [this] { goOn(std::nullopt); },
      .failed = [this, path](const PortFailure& failure) { goOn(troubleOf(failure, path)); },
      .refused = [](std::size_t, const std::string&) {},
      .leftOut = _leftOut});
  _session->begin();
  return std::nullopt;
}

// Deferred: the session or the device is in the middle of its work.
void PortSearch::goOn(std::optional<std::string> trouble) {
  _device->close();
  _setup.queue.async([this, trouble = std::move(trouble), number = _next, life = std::weak_ptr(_life)] {
    if (life.expired() || !_session || number != _next) return;
    _session.reset();
    if (!trouble) return _setup.ended(_path);
    _setup.tell(*trouble);
    askNext();
  });
}

}  // namespace varnel
