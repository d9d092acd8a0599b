#pragma once

#include <fcntl.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <mutex>
#include <string>
#include <thread>
#include <utility>

#include "host/FileDescriptor.h"
#include "tests/support/ScriptedModem.h"

namespace varnel {

/// A scripted modem whose diagnostic port is a pseudo-terminal. A symbolic link names the port, as udev's
/// links do. It has a thread of its own.
class PtyModem {
 public:
  /// The modem is plugged in. The link is made at this path.
  explicit PtyModem(std::string link) : _link(std::move(link)) { plugIn(); }
  PtyModem(const PtyModem&) = delete;
  PtyModem& operator=(const PtyModem&) = delete;
  ~PtyModem() { unplug(); }

  /// A modem that is plugged in has forgotten its masks.
  void plugIn() {
    const std::lock_guard lock(_mutex);
    _modem = {};
    _modem.otherAnswers = otherAnswers;
    _modem.beforeAnswers = beforeAnswers;
    for (const std::uint8_t equipment : equipments) _modem.numbers[equipment] = 0x1000;
    _line = FileDescriptor(::posix_openpt(O_RDWR | O_NOCTTY | O_CLOEXEC | O_NONBLOCK));
    if (::grantpt(_line.number()) != 0 || ::unlockpt(_line.number()) != 0)
      ADD_FAILURE() << "no pseudo-terminal";
    std::filesystem::create_symlink(::ptsname(_line.number()), _link);
    _isEnding = false;
    _thread = std::thread([this] { run(); });
  }
  void unplug() {
    _isEnding = true;
    if (_thread.joinable()) _thread.join();
    std::filesystem::remove(_link);
    _line = FileDescriptor();
    _outgoing.clear();
  }

  const std::string& link() const { return _link; }
  bool isOn(std::uint16_t code) {
    const std::lock_guard lock(_mutex);
    return _modem.isOn(code);
  }
  /// The requests since the modem was plugged in.
  std::vector<Bytes> requests() {
    const std::lock_guard lock(_mutex);
    return _modem.requests;
  }
  /// Sends these bytes when the line takes them.
  void send(const Bytes& bytes) {
    const std::lock_guard lock(_mutex);
    _outgoing.insert(_outgoing.end(), bytes.begin(), bytes.end());
  }
  /// Sends a record if its code is switched on.
  void sendLog(std::uint16_t code, const Bytes& payload) {
    if (isOn(code)) send(framed(logContents(code, payload)));
  }
  bool hasSentAll() {
    const std::lock_guard lock(_mutex);
    return _outgoing.empty();
  }

  /// For the script, from the next time on that the modem is plugged in.
  std::vector<std::pair<Bytes, Bytes>> otherAnswers;
  Bytes beforeAnswers;
  /// Of which it has all log codes, besides those of the script.
  std::vector<std::uint8_t> equipments;
  /// When there is one, it makes the answers in place of the script.
  std::function<Bytes(ByteView)> answer;

 private:
  void run() {
    while (!_isEnding) {
      const bool hasOutgoing = !hasSentAll();
      pollfd line{.fd = _line.number(),
                  .events = static_cast<short>(hasOutgoing ? POLLIN | POLLOUT : POLLIN),
                  .revents = 0};
      ::poll(&line, 1, 5);
      // While nobody has the other side open, the line is hung up.
      if ((line.revents & POLLHUP) != 0) ::usleep(5000);
      if ((line.revents & POLLIN) != 0) takeRequests();
      if ((line.revents & POLLOUT) != 0) sendSome();
    }
  }
  void takeRequests() {
    Bytes room(4096);
    const ssize_t count = ::read(_line.number(), room.data(), room.size());
    if (count <= 0) return;
    room.resize(static_cast<std::size_t>(count));
    const std::lock_guard lock(_mutex);
    const Bytes answers = answer ? answer(room) : _modem.take(room);
    _outgoing.insert(_outgoing.end(), answers.begin(), answers.end());
  }
  void sendSome() {
    const std::lock_guard lock(_mutex);
    const ssize_t count =
        ::write(_line.number(), _outgoing.data(), std::min<std::size_t>(_outgoing.size(), 4096));
    if (count > 0) _outgoing.erase(_outgoing.begin(), _outgoing.begin() + count);
  }

  const std::string _link;
  FileDescriptor _line;
  std::thread _thread;
  std::atomic<bool> _isEnding = false;
  std::mutex _mutex;  // guards what follows
  ScriptedModem _modem;
  Bytes _outgoing;
};

}  // namespace varnel
