#include "host/ChildServer.h"

#include <pthread.h>
#include <sys/prctl.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <QProcessEnvironment>
#include <QStandardPaths>
#include <QTimer>
#include <algorithm>
#include <array>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <stdexcept>
#include <string_view>
#include <system_error>
#include <utility>

#include "host/Printable.h"
#include "host/SocketConnection.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;

constexpr const char* programName = "varnel-telephonyd";
constexpr std::string_view linePrefix = "varnel-telephonyd: ";
constexpr std::string_view servingPrefix = "serving ";
constexpr std::string_view socketOfStates = "notify";
// The last line says why the server ended.
constexpr std::size_t mostBytesOfLines = 8192;
// A modem that is to be made quiet takes a while.
constexpr std::chrono::milliseconds patienceAtEnd = 3s;

bool isProgram(const fs::path& path) {
  std::error_code failure;
  return fs::is_regular_file(path, failure) && ::access(path.c_str(), X_OK) == 0;
}

FileDescriptor socketFor(const fs::path& path) {
  const sockaddr_un address = socketAddress(path);
  FileDescriptor socket(::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
  if (!socket.isOpen() ||
      ::bind(socket.number(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0)
    throw std::runtime_error("the socket " + path.string() +
                             " cannot be made: " + std::generic_category().message(errno));
  return socket;
}

// In the child, before the program begins.
void prepareChild(pid_t parent) {
  sigset_t none;
  ::sigemptyset(&none);
  ::pthread_sigmask(SIG_SETMASK, &none, nullptr);
  ::prctl(PR_SET_PDEATHSIG, SIGTERM);
  // The parent may have ended before the call.
  if (::getppid() != parent) ::_exit(1);
}

}  // namespace

fs::path serverProgram() {
  std::error_code failure;
  const fs::path own = fs::read_symlink("/proc/self/exe", failure).parent_path();
  // The second one is where the build has it.
  for (const fs::path& path : {own / programName, own.parent_path() / programName / programName})
    if (isProgram(path)) return path;
  const QString found = QStandardPaths::findExecutable(QString::fromLatin1(programName));
  return found.isEmpty() ? fs::path(programName) : fs::path(found.toStdString());
}

ChildServer::ChildServer(const fs::path& program, const std::vector<std::string>& arguments,
                         Handlers handlers)
    : _handlers(std::move(handlers)),
      _states(socketFor(socketPath(_folder.path(), socketOfStates))),
      _stateNotifier(std::make_unique<QSocketNotifier>(_states.number(), QSocketNotifier::Read)),
      _process(std::make_unique<QProcess>()) {
  QStringList all;
  for (const std::string& argument : arguments) all.append(QString::fromStdString(argument));
  all << QStringLiteral("--runtime-dir") << QString::fromStdString(_folder.path())
      << QStringLiteral("--log-level") << QStringLiteral("-1");
  QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
  environment.insert(QStringLiteral("NOTIFY_SOCKET"),
                     QString::fromStdString(_folder.path() / socketOfStates));
  _process->setProcessEnvironment(environment);
  _process->setStandardInputFile(QProcess::nullDevice());
  _process->setStandardOutputFile(QProcess::nullDevice());
  _process->setChildProcessModifier([parent = ::getpid()] { prepareChild(parent); });

  QObject::connect(_stateNotifier.get(), &QSocketNotifier::activated, _stateNotifier.get(),
                   [this] { takeState(); });
  QObject::connect(_process.get(), &QProcess::readyReadStandardError, _process.get(),
                   [this] { takeLines(); });
  QObject::connect(
      _process.get(), &QProcess::errorOccurred, _process.get(),
      [this, program](QProcess::ProcessError error) {
        if (error != QProcess::FailedToStart) return;
        end(program.string() + " cannot be started: " + _process->errorString().toStdString() +
            "; install it beside varnel");
      },
      Qt::QueuedConnection);
  QObject::connect(
      _process.get(), &QProcess::finished, _process.get(),
      [this] {
        takeLines();
        end(whyItEnded());
      },
      Qt::QueuedConnection);
  _process->start(QString::fromStdString(program), all);
}

ChildServer::~ChildServer() {
  _process->disconnect();
  if (_process->state() == QProcess::NotRunning) return;
  askToEnd();
  if (_process->waitForFinished(static_cast<int>(_patience->remainingTime()))) return;
  _process->kill();
  _process->waitForFinished(static_cast<int>(patienceAtEnd.count()));
}

void ChildServer::beginEnd(const std::function<void()>& gone) {
  _hasEnded = true;
  _process->disconnect();
  QObject::connect(_process.get(), &QProcess::finished, _process.get(), gone, Qt::QueuedConnection);
  if (_process->state() == QProcess::NotRunning) {
    QMetaObject::invokeMethod(_process.get(), gone, Qt::QueuedConnection);
    return;
  }
  askToEnd();
  QTimer::singleShot(patienceAtEnd, _process.get(), [this] { _process->kill(); });
}

void ChildServer::askToEnd() {
  if (_patience) return;
  _patience = QDeadlineTimer(patienceAtEnd);
  _process->terminate();
}

void ChildServer::takeState() {
  std::array<char, 4096> datagram{};
  const ssize_t size = ::recv(_states.number(), datagram.data(), datagram.size(), 0);
  if (size <= 0 || _isReady || _hasEnded) return;
  if (!std::string_view(datagram.data(), static_cast<std::size_t>(size)).starts_with("READY=1")) return;
  _isReady = true;
  _handlers.ready();
}

void ChildServer::takeLines() {
  _lines += _process->readAllStandardError().toStdString();
  if (_lines.size() > mostBytesOfLines) _lines.erase(0, _lines.size() - mostBytesOfLines);
}

std::string ChildServer::whyItEnded() const {
  std::string why;
  for (std::string_view rest = _lines; !rest.empty();) {
    std::string_view line = rest.substr(0, rest.find('\n'));
    rest.remove_prefix(std::min(line.size() + 1, rest.size()));
    if (!line.starts_with(linePrefix)) continue;
    line.remove_prefix(linePrefix.size());
    if (!line.starts_with(servingPrefix)) why = line;
  }
  if (_process->exitStatus() == QProcess::CrashExit) return "the server was ended by a signal";
  if (_process->exitCode() == 0 || why.empty()) return "the server has ended";
  return printable(why);
}

void ChildServer::end(const std::string& why) {
  if (std::exchange(_hasEnded, true)) return;
  _handlers.ended(why);
}

}  // namespace varnel
