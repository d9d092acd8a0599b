#include <QAbstractEventDispatcher>
#include <QCoreApplication>
#include <QEventLoop>
#include <QLocalServer>
#include <QLocalSocket>
#include <QThread>
#include <algorithm>
#include <atomic>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <functional>
#include <memory>
#include <vector>

#include "host/SocketPorts.h"

// How fast messages of 200 bytes go one way through the ports, beside a bare loop of local sockets that only
// puts a length before each message. Both take turns in one process, with a thread per end.

namespace varnel {
namespace {

using Clock = std::chrono::steady_clock;

constexpr std::size_t messageSize = 200;
constexpr std::uint64_t messagesPerRound = 300'000;
constexpr int rounds = 15;
constexpr qint64 mostUnsent = 4 << 20;
// Of the bare loop's rate.
constexpr double leastRatio = 0.5;

std::atomic<std::uint64_t> received = 0;

// A thread with an event loop for what the function returns, until this object goes.
class Receiver {
 public:
  explicit Receiver(std::function<std::shared_ptr<void>()> setUp)
      : _thread(QThread::create([this, setUp = std::move(setUp)] {
          const auto end = setUp();
          QEventLoop loop;
          _isReady = true;
          while (!_isEnding) loop.processEvents(QEventLoop::WaitForMoreEvents);
        })) {
    _thread->start();
    while (!_isReady) QThread::usleep(100);
  }
  Receiver(const Receiver&) = delete;
  Receiver& operator=(const Receiver&) = delete;
  ~Receiver() {
    _isEnding = true;
    _thread->eventDispatcher()->wakeUp();
    _thread->wait();
  }

 private:
  std::atomic<bool> _isReady = false, _isEnding = false;
  const std::unique_ptr<QThread> _thread;
};

// Counts messages that have their length in four bytes before them.
class BareReceiver {
 public:
  explicit BareReceiver(const QString& path) {
    _server.listen(path);
    QObject::connect(&_server, &QLocalServer::newConnection, &_server, [this] {
      _socket = _server.nextPendingConnection();
      QObject::connect(_socket, &QLocalSocket::readyRead, _socket, [this] { take(); });
    });
  }

 private:
  void take() {
    _bytes += _socket->readAll();
    qsizetype at = 0;
    std::uint64_t count = 0;
    while (_bytes.size() - at >= 4) {
      std::uint32_t length = 0;
      std::memcpy(&length, _bytes.constData() + at, sizeof length);
      if (_bytes.size() - at - 4 < length) break;
      at += 4 + length;
      ++count;
    }
    _bytes.remove(0, at);
    received += count;
  }

  QLocalServer _server;
  QLocalSocket* _socket = nullptr;
  QByteArray _bytes;
};

// Messages a second.
double measure(const std::function<void()>& sendOne, const std::function<void()>& sendRest) {
  received = 0;
  const auto start = Clock::now();
  for (std::uint64_t i = 0; i < messagesPerRound; ++i) sendOne();
  sendRest();
  while (received < messagesPerRound) QThread::usleep(50);
  return static_cast<double>(messagesPerRound) / std::chrono::duration<double>(Clock::now() - start).count();
}

double bareRound(const std::filesystem::path& folder) {
  const QString path = QString::fromStdString((folder / "bare").string());
  const Receiver receiver([path] { return std::make_shared<BareReceiver>(path); });
  QLocalSocket socket;
  socket.connectToServer(path);
  socket.waitForConnected();
  const std::vector<char> message(messageSize, 'x');
  const auto sendOne = [&] {
    const std::uint32_t length = messageSize;
    while (socket.bytesToWrite() >= mostUnsent) socket.waitForBytesWritten(-1);
    socket.write(reinterpret_cast<const char*>(&length), sizeof length);
    socket.write(message.data(), messageSize);
  };
  return measure(sendOne, [&] {
    while (socket.bytesToWrite() > 0) socket.waitForBytesWritten(-1);
  });
}

double portRound(const std::filesystem::path& folder) {
  const Receiver receiver([folder]() -> std::shared_ptr<void> {
    auto port = SocketPorts(folder)
                    .createLocalPort("port",
                                     [](std::int32_t, ByteView) {
                                       ++received;
                                       return std::optional<Bytes>();
                                     })
                    .port;
    port->deliverOnMainQueue();
    return std::shared_ptr<LocalPort>(std::move(port));
  });
  SocketPorts ports(folder);
  const auto port = ports.createRemotePort("port");
  const Bytes message(messageSize, 'x');
  const auto sendOne = [&] {
    if (port->sendRequest(0, message, std::chrono::minutes(1), std::nullopt).status != 0) std::abort();
  };
  // The event loop sends what is queued.
  return measure(sendOne, [&] {
    while (received < messagesPerRound) QCoreApplication::processEvents(QEventLoop::AllEvents, 1);
  });
}

int run() {
  std::string folder = (std::filesystem::temp_directory_path() / "varnel-link-XXXXXX").string();
  if (!::mkdtemp(folder.data())) return 1;
  std::vector<double> bare, ports;
  for (int round = 0; round < rounds; ++round) {
    bare.push_back(bareRound(folder));
    ports.push_back(portRound(folder));
  }
  std::filesystem::remove_all(folder);
  // Other work can only slow a round down.
  const double bareRate = std::ranges::max(bare), portRate = std::ranges::max(ports);
  std::printf("one way, messages of %zu bytes: ports %.0f/s, bare loop %.0f/s, ratio %.2f\n", messageSize,
              portRate, bareRate, portRate / bareRate);
  if (portRate >= leastRatio * bareRate) return 0;
  std::fprintf(stderr, "The ports are too slow: they must reach %.1f of the bare loop's rate\n", leastRatio);
  return 1;
}

}  // namespace
}  // namespace varnel

int main(int argumentCount, char** arguments) {
  const QCoreApplication application(argumentCount, arguments);
  return varnel::run();
}
