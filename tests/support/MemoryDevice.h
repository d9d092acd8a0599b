#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "programs/varnel-telephonyd/sources/PortDevice.h"
#include "tests/support/ScriptedModem.h"

namespace varnel {

/// A device in memory with a modem behind it.
struct MemoryDevice {
  ScriptedModem modem;
  std::optional<std::string> trouble;
  bool isOpen = false;
  bool isSerialLine = true;
  int openings = 0;
  PortDevice::Handlers handlers;
  Bytes sent;

  /// What a read of a device gives that is no serial line.
  static Bytes message(const std::vector<Bytes>& buffers) {
    Bytes bytes{32, 0, 0, 0, static_cast<std::uint8_t>(buffers.size()), 0, 0, 0};
    for (const Bytes& buffer : buffers) {
      bytes.insert(bytes.end(), {static_cast<std::uint8_t>(buffer.size() & 0xFF),
                                 static_cast<std::uint8_t>(buffer.size() >> 8), 0, 0});
      bytes.insert(bytes.end(), buffer.begin(), buffer.end());
    }
    return bytes;
  }
  /// Lets the modem answer until it has nothing more to say.
  void run() {
    while (isOpen && !sent.empty()) {
      const Bytes answer = modem.take(std::exchange(sent, {}));
      if (answer.empty()) continue;
      handlers.bytesCame(isSerialLine ? answer : message({answer}));
    }
  }
  void unplug() {
    isOpen = false;
    handlers.wentAway();
  }
};

/// The device as a port opens it.
class MemoryPortDevice final : public PortDevice {
 public:
  explicit MemoryPortDevice(MemoryDevice& device) : _device(device) {}
  std::optional<std::string> open(Handlers handlers) override {
    ++_device.openings;
    if (_device.trouble) return _device.trouble;
    _device.isOpen = true;
    _device.sent.clear();
    _device.handlers = std::move(handlers);
    return std::nullopt;
  }
  bool isSerialLine() const override { return _device.isSerialLine; }
  void send(ByteView bytes) override { _device.sent.insert(_device.sent.end(), bytes.begin(), bytes.end()); }
  void close() override { _device.isOpen = false; }

 private:
  MemoryDevice& _device;
};

}  // namespace varnel
