#include "host/SocketServer.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdlib>
#include <system_error>
#include <utility>

#include "base/Log.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;

constexpr std::string_view lockSuffix = ".lock";
constexpr int connectionQueue = 128;
// After this many the server lets the rest of the program run.
constexpr int connectionsAtATime = 64;
constexpr std::chrono::milliseconds refusalLineInterval = 10s;
constexpr std::chrono::milliseconds descriptorWait = 100ms;
// Members of the group can make any number of files in a shared folder.
constexpr int mostLooks = 1000;

SocketFile identityOf(const struct stat& status) { return {status.st_dev, status.st_ino}; }

std::optional<SocketFile> fileUnder(const fs::path& path) {
  struct stat status {};
  return ::lstat(path.c_str(), &status) == 0 ? std::optional(identityOf(status)) : std::nullopt;
}

std::optional<SocketFile> fileOf(const FileDescriptor& file) {
  struct stat status {};
  return ::fstat(file.number(), &status) == 0 ? std::optional(identityOf(status)) : std::nullopt;
}

constexpr std::string_view useOtherFolder = "name another folder with --runtime-dir";

[[noreturn]] void fail(const std::string& what, const fs::path& path, int error) {
  throw std::runtime_error(what + " " + path.string() + ": " + std::generic_category().message(error) + "; " +
                           (fileUnder(path) ? "remove it, or " : "") + std::string(useOtherFolder));
}

[[noreturn]] void nameIsTaken(const fs::path& path) {
  throw SocketNameTaken("another process serves " + path.string() + "; end it, or " +
                        std::string(useOtherFolder));
}

// Whether another user, who is not root, has put there what is there.
bool isOfStranger(const fs::path& path) {
  struct stat status {};
  return ::lstat(path.c_str(), &status) == 0 && status.st_uid != ::geteuid() && status.st_uid != 0;
}

// A folder may hold anything, so it is not removed but gets a name that nobody could know and take before.
bool renameFolder(const fs::path& path) {
  std::string aside = path.string() + ".XXXXXX";
  if (!::mkdtemp(aside.data())) return false;
  if (::rename(path.c_str(), aside.c_str()) == 0) return true;
  ::rmdir(aside.c_str());
  return false;
}

// The owner of a folder may remove what others have put there.
void clearAway(const fs::path& path) {
  if (::unlink(path.c_str()) != 0 && !renameFolder(path)) return;
  logWarning("Another user had taken the server's name %s: it is free again", path.string());
}

// Whether others could hold the lock on this file.
bool isOpenToOthers(const FileDescriptor& file) {
  struct stat status {};
  return ::fstat(file.number(), &status) == 0 && (status.st_mode & (S_IRWXG | S_IRWXO)) != 0;
}

fs::path lockPathOf(const fs::path& socketPath) { return socketPath.string() + std::string(lockSuffix); }

FileDescriptor localSocket() {
  return FileDescriptor(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
}

// Whether a process listens there, of any user, even when it is busy.
bool isServed(const fs::path& path) {
  const FileDescriptor socket = localSocket();
  const sockaddr_un address = socketAddress(path);
  return ::connect(socket.number(), reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0 ||
         errno == EAGAIN;
}

mode_t socketModeFor(const SocketGate& gate) { return gate.access.isShared() ? 0660 : 0600; }

// Members of a shared folder's group find out whether a viewer's name is taken, and the server clears away
// what viewers of other users left behind. Whoever can open a file can hold its lock, so a server's is
// closed.
mode_t lockModeFor(const SocketGate& gate) { return gate.ownsName ? 0600 : socketModeFor(gate); }

FileDescriptor spareDescriptor() { return FileDescriptor(::open("/dev/null", O_RDONLY | O_CLOEXEC)); }

}  // namespace

SocketServer::NameLock::NameLock(const fs::path& socketPath, const SocketGate& gate)
    : _path(lockPathOf(socketPath)),
      _socketPath(socketPath),
      _mode(lockModeFor(gate)),
      _ownsName(gate.ownsName) {
  lock();
}

// A system can forbid to open another user's file in a shared folder for a program that would also make it.
// So opening and making are two steps.
FileDescriptor SocketServer::NameLock::openOrMake() const {
  while (true) {
    FileDescriptor file(::open(_path.c_str(), O_RDWR | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK));
    if (file.isOpen() || errno != ENOENT) return file;
    file = FileDescriptor(::open(_path.c_str(), O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, _mode));
    // The umask has taken bits away.
    if (file.isOpen()) ::fchmod(file.number(), _mode);
    if (file.isOpen() || errno != EEXIST) return file;
  }
}

void SocketServer::NameLock::lock() {
  // The owner removes the file when it ends. So the file that was opened can differ from the file that is
  // there once the lock is held.
  if (_ownsName && isOfStranger(_path)) clearAway(_path);
  while (true) {
    FileDescriptor file = openOrMake();
    if (!file.isOpen()) fail("cannot open", _path, errno);
    // A dead server has left it, or an older one is alive, which its socket shows.
    if (_ownsName && isOpenToOthers(file) && ::unlink(_path.c_str()) == 0) continue;
    if (::flock(file.number(), LOCK_EX | LOCK_NB) != 0) {
      if (errno == EWOULDBLOCK) nameIsTaken(_socketPath);
      fail("cannot lock", _path, errno);
    }
    if (fileOf(file) != fileUnder(_path)) continue;
    _file = std::move(file);
    return;
  }
}

void SocketServer::NameLock::keep() {
  if (fileOf(_file) == fileUnder(_path)) {
    ::futimens(_file.number(), nullptr);
  } else {
    lock();
  }
}

SocketServer::NameLock::~NameLock() {
  if (fileOf(_file) == fileUnder(_path)) ::unlink(_path.c_str());
}

SocketServer::SocketServer(const fs::path& path, ConnectionHandler handler, const SocketLimits& limits,
                           SocketGate gate)
    : _path(path),
      _handler(std::move(handler)),
      _limits(limits),
      _gate(std::move(gate)),
      _lock(path, _gate),
      _spare(spareDescriptor()),
      _places(std::make_shared<const int>(0)) {
  if (_gate.ownsName && isOfStranger(path)) clearAway(path);
  // A program that cleans up may have removed a live server's lock file.
  if (isServed(path)) nameIsTaken(path);
  listen();
  _look.callOnTimeout([this] { keepName(); });
  _look.start(limits.lookInterval);
}

SocketServer::~SocketServer() {
  if (_socketFile && _socketFile == fileUnder(_path)) ::unlink(_path.c_str());
}

void SocketServer::listen() {
  // The lock is ours, so whatever is there now belongs to a dead process.
  ::unlink(_path.c_str());
  FileDescriptor socket = localSocket();
  const sockaddr_un address = socketAddress(_path);
  // The file gets the socket's mode, so no other user ever sees it open. The umask takes away what the group
  // of a shared folder needs.
  if (!socket.isOpen() || ::fchmod(socket.number(), 0600) != 0 ||
      ::bind(socket.number(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0 ||
      (_gate.access.isShared() && ::chmod(_path.c_str(), socketModeFor(_gate)) != 0) ||
      ::listen(socket.number(), connectionQueue) != 0)
    fail("cannot listen on", _path, errno);
  _socketFile = fileUnder(_path);
  _notifier = std::make_unique<QSocketNotifier>(socket.number(), QSocketNotifier::Read);
  QObject::connect(_notifier.get(), &QSocketNotifier::activated, _notifier.get(),
                   [this] { acceptConnections(); });
  _listening = std::move(socket);
}

void SocketServer::keepName() noexcept {
  try {
    _lock.keep();
    if (fileUnder(_path) == _socketFile) {
      ::utimensat(AT_FDCWD, _path.c_str(), nullptr, AT_SYMLINK_NOFOLLOW);
      return;
    }
    logWarning("Somebody has removed the socket %s: it is made anew", _path.string());
    if (isServed(_path)) nameIsTaken(_path);
    listen();
  } catch (const std::runtime_error& error) {
    logError("The socket %s cannot be kept: %s", _path.string(), error.what());
  }
}

void SocketServer::acceptConnections() noexcept {
  for (int count = 0; count < connectionsAtATime; ++count) {
    if (!acceptOne()) return;
  }
}

// False when no connection is waiting, or when there is no descriptor for it.
bool SocketServer::acceptOne() {
  FileDescriptor socket(::accept4(_listening.number(), nullptr, nullptr, SOCK_CLOEXEC | SOCK_NONBLOCK));
  if (!socket.isOpen()) {
    if (errno == ECONNABORTED || errno == EINTR) return true;
    if (errno == EMFILE || errno == ENFILE) refuseOne();
    return false;
  }
  if (!admits(socket)) return true;
  if (!hasRoom() && _gate.makeRoom) _gate.makeRoom();
  if (!hasRoom()) {
    turnAway(socket, _gate.refusalWhenFull, _tellingOfNoRoom, "as many are open as there may be");
    return true;
  }
  _handler(std::make_unique<SocketConnection>(std::move(socket), _places, _limits.frameTime));
  return true;
}

bool SocketServer::hasRoom() const {
  return static_cast<std::size_t>(_places.use_count() - 1) < _limits.connections;
}

bool SocketServer::admits(const FileDescriptor& socket) {
  const auto peer = peerOf(socket.number());
  if (peer && (_gate.accepts ? _gate.accepts(*peer) : _gate.access.accepts(*peer))) return true;
  turnAway(socket, _gate.refusalOfStranger, _tellingOfStrangers,
           peer ? "user " + std::to_string(peer->user) + " has no right to them" : "their user is not known");
  return false;
}

// There is no descriptor left. Accepts and refuses the next connection with the spare one; otherwise it would
// wake this program again and again.
void SocketServer::refuseOne() {
  _spare = FileDescriptor();
  FileDescriptor socket(::accept4(_listening.number(), nullptr, nullptr, SOCK_CLOEXEC | SOCK_NONBLOCK));
  if (socket.isOpen())
    turnAway(socket, _gate.refusalWhenFull, _tellingOfNoRoom, "this program may open no more files");
  const bool wasAccepted = socket.isOpen();
  socket = FileDescriptor();
  _spare = spareDescriptor();
  if (!wasAccepted || !_spare.isOpen()) waitForDescriptors();
}

void SocketServer::turnAway(const FileDescriptor& socket, const Bytes& refusal, Telling& telling,
                            const std::string& reason) {
  // A peer that cannot take the refusal learns it from the end of the connection.
  static_cast<void>(::send(socket.number(), refusal.data(), refusal.size(), MSG_NOSIGNAL));
  if (telling.isDue()) logWarning("Connections to %s are refused: %s", _path.string(), reason);
}

bool SocketServer::Telling::isDue() {
  if (_since.isValid() && !_since.hasExpired(refusalLineInterval.count())) return false;
  _since.start();
  return true;
}

void SocketServer::waitForDescriptors() {
  _notifier->setEnabled(false);
  QTimer::singleShot(descriptorWait, _notifier.get(), [this] {
    if (!_spare.isOpen()) _spare = spareDescriptor();
    _notifier->setEnabled(true);
  });
}

void removeLeftovers(const fs::path& folder) {
  std::error_code failure;
  int looks = 0;
  for (fs::directory_iterator entry(folder, failure), end; !failure && entry != end && looks < mostLooks;
       entry.increment(failure), ++looks) {
    const std::string name = entry->path().filename().string();
    if (!name.ends_with(lockSuffix)) continue;
    const fs::path socketPath = folder / name.substr(0, name.size() - lockSuffix.size());
    const FileDescriptor file(::open(entry->path().c_str(), O_RDWR | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK));
    // While the lock is held here, no program takes the name.
    if (!file.isOpen() || ::flock(file.number(), LOCK_EX | LOCK_NB) != 0) continue;
    if (fileOf(file) != fileUnder(entry->path()) || isServed(socketPath)) continue;
    ::unlink(socketPath.c_str());
    ::unlink(entry->path().c_str());
  }
}

}  // namespace varnel
