#pragma once

#include <QSocketNotifier>
#include <QTimer>
#include <functional>
#include <memory>
#include <string>

#include "base/Bytes.h"
#include "host/FileDescriptor.h"

namespace varnel {

/// A pseudo-terminal from the side that plays a device. Other programs open the device as they like; bytes
/// pass unchanged.
class PseudoTerminal final {
 public:
  /// Makes the device. The handler gets, from the event loop, what is written to it. Throws std::system_error
  /// when the system has no more of them.
  explicit PseudoTerminal(std::function<void(ByteView bytes)> bytesCame);
  PseudoTerminal(const PseudoTerminal&) = delete;
  PseudoTerminal& operator=(const PseudoTerminal&) = delete;
  ~PseudoTerminal();

  /// The name of the device, such as "/dev/pts/3".
  const std::string& name() const { return _name; }

  /// Sends all of these bytes or, when nobody has the device open or its reader is behind by 64 KiB, none.
  /// Returns whether it does.
  bool send(ByteView bytes);

 private:
  void beginWatching();
  void readBytes() noexcept;
  void writeBytes() noexcept;
  void beHungUp();
  void lookForReader();

  const std::function<void(ByteView)> _bytesCame;
  FileDescriptor _line;
  std::string _name;
  Bytes _outgoing;  // what the line has not taken yet
  std::unique_ptr<QSocketNotifier> _readable, _writable;
  QTimer _look;  // runs while nobody has the device open
};

}  // namespace varnel
