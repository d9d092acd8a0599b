#pragma once

#include <termios.h>

#include <QSocketNotifier>
#include <QTimer>
#include <chrono>
#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "host/FileDescriptor.h"
#include "programs/varnel-telephonyd/sources/PortDevice.h"

namespace varnel {

/// The character device of a modem's diagnostic port: a serial line, which is made raw (8N1) while it is
/// open, or a device that is none. The event loop reads it, a limited number of bytes per turn.
class DiagnosticPort final : public PortDevice {
 public:
  explicit DiagnosticPort(std::string path) : _path(std::move(path)) {}
  DiagnosticPort(const DiagnosticPort&) = delete;
  DiagnosticPort& operator=(const DiagnosticPort&) = delete;
  ~DiagnosticPort() override {
    _readable.reset();
    _writable.reset();
    close();
  }

  std::optional<std::string> open(Handlers handlers) override;
  bool isSerialLine() const override { return _isSerialLine; }
  void send(ByteView bytes) override;
  void close() override;

 private:
  void readBytes() noexcept;
  bool isBusy();
  void restAWhile();
  void writeBytes() noexcept;
  void goAway();

  const std::string _path;
  Handlers _handlers;
  FileDescriptor _device;
  bool _isSerialLine = false;
  std::optional<termios> _settingsBefore;  // those of the serial line before it was opened
  Bytes _room;                             // for what is read
  Bytes _outgoing;                         // what the device has not taken yet
  std::unique_ptr<QSocketNotifier> _readable, _writable;
  QTimer _rest;               // runs while the device is not read
  std::size_t _inWindow = 0;  // bytes read since the time below
  std::chrono::steady_clock::time_point _windowStart;
  bool _isBusy = false;  // many bytes came in the window before
};

}  // namespace varnel
