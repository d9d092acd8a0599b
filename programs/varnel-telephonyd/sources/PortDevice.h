#pragma once

#include <functional>
#include <optional>
#include <string>

#include "base/Bytes.h"

namespace varnel {

/// The device of a diagnostic port.
class PortDevice {
 public:
  /// The device calls them from the event loop, while it is open. They may close it.
  struct Handlers {
    std::function<void(ByteView bytes)> bytesCame;  ///< gets what one read gave
    std::function<void()> wentAway;                 ///< was unplugged
  };

  virtual ~PortDevice() = default;
  /// Opens the device for this program alone. Returns one sentence that says why it cannot, and what to do;
  /// nothing on success.
  virtual std::optional<std::string> open(Handlers handlers) = 0;
  /// Whether the open device is a serial line. What is none gives its bytes read by read.
  virtual bool isSerialLine() const = 0;
  /// Sends the bytes as soon as the device takes them.
  virtual void send(ByteView bytes) = 0;
  virtual void close() = 0;
};

}  // namespace varnel
