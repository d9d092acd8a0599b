#include "programs/varnel-telephonyd/sources/DiagnosticPort.h"

#include <fcntl.h>
#include <grp.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <termios.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <chrono>
#include <cstddef>
#include <vector>

#include "programs/varnel-telephonyd/sources/PortHolders.h"
#include "programs/varnel-telephonyd/sources/PortTrouble.h"

namespace varnel {

namespace {

// Per turn of the event loop. The viewers' channels can send more messages in a turn than these bytes hold.
constexpr std::size_t mostPerTurn = 1 << 14;
// After a turn with few bytes the next one waits a little, so that a modem's records are taken several at a
// time: each turn costs more than a record. The system holds what comes meanwhile.
constexpr std::size_t fewBytes = 1 << 10;
constexpr std::chrono::milliseconds pause(10);
// When as many come during a pause, there is none.
constexpr std::size_t manyBytes = 1 << 13;
// A port that takes nothing gets no more. Requests are few and short.
constexpr std::size_t mostOutgoing = 1 << 16;

// The group whose members may read and write the device; empty when there is none.
std::string groupOf(const struct stat& status) {
  constexpr mode_t both = S_IRGRP | S_IWGRP;
  if ((status.st_mode & both) != both) return {};
  std::array<char, 4096> text{};
  group entry{};
  group* found = nullptr;
  if (::getgrgid_r(status.st_gid, &entry, text.data(), text.size(), &found) == 0 && found)
    return entry.gr_name;
  return std::to_string(status.st_gid);
}

std::string troubleOfHolders(const std::string& path, const std::vector<std::string>& holders) {
  return holders.empty() ? troubleOfUnknownHolder(path, runsModemManager()) : troubleOfBusy(path, holders);
}

std::string troubleOfOpening(const std::string& path, const struct stat& status, int error) {
  switch (error) {
    case ENOENT:
    case ENXIO:
    case ENODEV:
      return troubleOfMissing(path);
    case EACCES:
    case EPERM:
      return troubleOfPermission(path, groupOf(status));
    case EBUSY:
      return troubleOfHolders(path, holdersOf(status.st_rdev));
    default:
      return troubleOfSystem(path, error);
  }
}

// Raw, eight bits, no parity, one stop bit. The speed of a line over USB has no meaning. Returns the settings
// from before; nothing when the device is no serial line, which has no such settings and needs none.
std::optional<termios> makeRaw(int device) {
  termios before{};
  if (::tcgetattr(device, &before) != 0) return std::nullopt;
  termios settings = before;
  ::cfmakeraw(&settings);
  settings.c_cflag &= ~static_cast<tcflag_t>(CSTOPB | CRTSCTS);
  settings.c_cflag |= CLOCAL | CREAD;
  settings.c_cc[VMIN] = 1;
  settings.c_cc[VTIME] = 0;
  ::tcsetattr(device, TCSANOW, &settings);
  return before;
}

// Whether the device is the terminal that this program was started from. Others fail to tell the session.
bool isOwnTerminal(int device) { return ::tcgetsid(device) == ::getsid(0); }

bool hasNothingNow(int error) { return error == EAGAIN || error == EINTR; }

}  // namespace

std::optional<std::string> DiagnosticPort::open(Handlers handlers) {
  struct stat status {};
  if (::stat(_path.c_str(), &status) != 0)
    return troubleOfOpening(_path, status, errno == ENOTDIR ? ENOENT : errno);
  if (S_ISREG(status.st_mode)) return troubleOfFile(_path);
  if (!S_ISCHR(status.st_mode)) return troubleOfNoDevice(_path);
  FileDescriptor device(::open(_path.c_str(), O_RDWR | O_NOCTTY | O_NONBLOCK | O_CLOEXEC));
  if (!device.isOpen()) return troubleOfOpening(_path, status, errno);
  if (isOwnTerminal(device.number())) return troubleOfOwnTerminal(_path);
  if (const auto holders = holdersOf(status.st_rdev); !holders.empty()) return troubleOfBusy(_path, holders);
  // Other programs of this kind respect the lock, and others than root the exclusive use.
  if (::flock(device.number(), LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK)
    return troubleOfHolders(_path, {});
  ::ioctl(device.number(), TIOCEXCL);
  _settingsBefore = makeRaw(device.number());
  _isSerialLine = _settingsBefore.has_value();
  _handlers = std::move(handlers);
  _device = std::move(device);
  _room.resize(mostPerTurn);
  _readable = std::make_unique<QSocketNotifier>(_device.number(), QSocketNotifier::Read);
  QObject::connect(_readable.get(), &QSocketNotifier::activated, _readable.get(), [this] { readBytes(); });
  _rest.setSingleShot(true);
  _rest.callOnTimeout(_readable.get(), [this] { _readable->setEnabled(true); });
  _writable = std::make_unique<QSocketNotifier>(_device.number(), QSocketNotifier::Write);
  _writable->setEnabled(false);
  QObject::connect(_writable.get(), &QSocketNotifier::activated, _writable.get(), [this] { writeBytes(); });
  return std::nullopt;
}

void DiagnosticPort::send(ByteView bytes) {
  if (!_device.isOpen() || bytes.size() > mostOutgoing - _outgoing.size()) return;
  _outgoing.insert(_outgoing.end(), bytes.begin(), bytes.end());
  writeBytes();
}

void DiagnosticPort::close() {
  _rest.stop();
  for (auto* const notifier : {&_readable, &_writable}) {
    if (!*notifier) continue;
    (*notifier)->setEnabled(false);
    notifier->release()->deleteLater();  // it may be at work now
  }
  _outgoing.clear();
  if (_device.isOpen()) {
    if (_settingsBefore) ::tcsetattr(_device.number(), TCSANOW, &*_settingsBefore);
    ::ioctl(_device.number(), TIOCNXCL);
  }
  _device = FileDescriptor();
}

void DiagnosticPort::readBytes() noexcept {
  for (std::size_t total = 0; total < mostPerTurn && _device.isOpen();) {
    const ssize_t count = ::read(_device.number(), _room.data(), _room.size() - total);
    // Some devices are always said to be readable.
    if (count < 0 && hasNothingNow(errno)) return total == 0 ? restAWhile() : void();
    if (count <= 0) return goAway();
    total += static_cast<std::size_t>(count);
    _handlers.bytesCame(ByteView(_room).first(static_cast<std::size_t>(count)));
    _inWindow += static_cast<std::size_t>(count);
    if (static_cast<std::size_t>(count) < fewBytes) return isBusy() ? void() : restAWhile();
    // What is no serial line may refuse to give less than a whole message.
    if (!_isSerialLine) return;
  }
}

// What the system holds for a fast modem would not last for the pause. Short reads come from fast ones, too.
bool DiagnosticPort::isBusy() {
  const auto now = std::chrono::steady_clock::now();
  if (now - _windowStart >= pause) {
    _isBusy = _inWindow >= manyBytes;
    _inWindow = 0;
    _windowStart = now;
  }
  return _isBusy;
}

void DiagnosticPort::restAWhile() {
  if (!_readable) return;
  _readable->setEnabled(false);
  _rest.start(pause);
}

// An error that lasts is met by the reader too. A device that takes no byte and tells no error fails as well:
// asking it again at once might never end.
void DiagnosticPort::writeBytes() noexcept {
  while (!_outgoing.empty() && _device.isOpen()) {
    const ssize_t count = ::write(_device.number(), _outgoing.data(), _outgoing.size());
    if (count < 0 && hasNothingNow(errno)) break;
    if (count <= 0) {
      _outgoing.clear();
    } else {
      _outgoing.erase(_outgoing.begin(), _outgoing.begin() + count);
    }
  }
  if (_writable) _writable->setEnabled(!_outgoing.empty());
}

void DiagnosticPort::goAway() {
  close();
  _handlers.wentAway();
}

}  // namespace varnel
