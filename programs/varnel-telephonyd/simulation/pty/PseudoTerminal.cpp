#include "programs/varnel-telephonyd/simulation/pty/PseudoTerminal.h"

#include <fcntl.h>
#include <poll.h>
#include <termios.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <chrono>
#include <cstdlib>
#include <system_error>
#include <utility>

namespace varnel {

namespace {

constexpr std::size_t mostOutgoing = 1 << 16;
constexpr std::size_t mostPerRead = 1 << 12;
// The system tells when the last program closes the device, but not when one opens it.
constexpr std::chrono::milliseconds lookInterval(100);
// Ends what an earlier reader has got the first half of.
constexpr std::uint8_t frameEnd = 0x7E;

[[noreturn]] void throwError() {
  throw std::system_error(errno, std::generic_category(), "cannot make a pseudo-terminal");
}

bool hasNothingNow(int error) { return error == EAGAIN || error == EINTR; }

}  // namespace

PseudoTerminal::PseudoTerminal(std::function<void(ByteView bytes)> bytesCame)
    : _bytesCame(std::move(bytesCame)), _line(::posix_openpt(O_RDWR | O_NOCTTY | O_NONBLOCK | O_CLOEXEC)) {
  std::array<char, 64> name{};
  if (!_line.isOpen() || ::grantpt(_line.number()) != 0 || ::unlockpt(_line.number()) != 0 ||
      ::ptsname_r(_line.number(), name.data(), name.size()) != 0)
    throwError();
  _name = name.data();
  termios settings{};
  if (::tcgetattr(_line.number(), &settings) != 0) throwError();
  ::cfmakeraw(&settings);
  if (::tcsetattr(_line.number(), TCSANOW, &settings) != 0) throwError();
  // Before the device was open for the first time, the system does not tell that nobody has it open.
  const FileDescriptor once(::open(_name.c_str(), O_RDWR | O_NOCTTY | O_CLOEXEC));
  if (!once.isOpen()) throwError();
  _look.callOnTimeout(&_look, [this] { lookForReader(); });
  beHungUp();
}

PseudoTerminal::~PseudoTerminal() {
  _readable.reset();
  _writable.reset();
}

bool PseudoTerminal::send(ByteView bytes) {
  if (!_readable || bytes.size() > mostOutgoing - _outgoing.size()) return false;
  const bool isAtWork = !_outgoing.empty();
  _outgoing.insert(_outgoing.end(), bytes.begin(), bytes.end());
  if (!isAtWork) writeBytes();
  return true;
}

void PseudoTerminal::beginWatching() {
  _outgoing.assign(1, frameEnd);
  _readable = std::make_unique<QSocketNotifier>(_line.number(), QSocketNotifier::Read);
  QObject::connect(_readable.get(), &QSocketNotifier::activated, _readable.get(), [this] { readBytes(); });
  _writable = std::make_unique<QSocketNotifier>(_line.number(), QSocketNotifier::Write);
  QObject::connect(_writable.get(), &QSocketNotifier::activated, _writable.get(), [this] { writeBytes(); });
}

void PseudoTerminal::readBytes() noexcept {
  std::array<std::uint8_t, mostPerRead> room;
  const ssize_t count = ::read(_line.number(), room.data(), room.size());
  if (count < 0 && hasNothingNow(errno)) return;
  if (count <= 0) return beHungUp();
  _bytesCame(ByteView(room).first(static_cast<std::size_t>(count)));
}

// An error that lasts is met by `readBytes` too.
void PseudoTerminal::writeBytes() noexcept {
  const ssize_t count = ::write(_line.number(), _outgoing.data(), _outgoing.size());
  if (count > 0) _outgoing.erase(_outgoing.begin(), _outgoing.begin() + count);
  _writable->setEnabled(!_outgoing.empty());
}

void PseudoTerminal::beHungUp() {
  for (auto* const notifier : {&_readable, &_writable}) {
    if (!*notifier) continue;
    (*notifier)->setEnabled(false);
    notifier->release()->deleteLater();  // it may be at work now
  }
  _outgoing.clear();
  _look.start(lookInterval);
}

void PseudoTerminal::lookForReader() {
  pollfd line{.fd = _line.number(), .events = POLLIN, .revents = 0};
  if (::poll(&line, 1, 0) < 0 || (line.revents & POLLHUP) != 0) return;
  _look.stop();
  beginWatching();
}

}  // namespace varnel
