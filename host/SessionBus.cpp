#include "host/SessionBus.h"

#include <QDBusConnection>
#include <QDBusError>
#include <QDBusMessage>
#include <cstdlib>
#include <filesystem>

namespace varnel {

namespace {

constexpr int replyTimeout = 500;  // milliseconds

// A bus connection of Qt would wait much longer for a bus that does not answer, even when the program ends.
// So this class connects to the bus as to any peer, and sends the first message itself.
class BusConnection {
 public:
  explicit BusConnection(const std::string& address)
      : _connection(QDBusConnection::connectToPeer(QString::fromStdString(address), name())) {}
  BusConnection(const BusConnection&) = delete;
  BusConnection& operator=(const BusConnection&) = delete;
  ~BusConnection() { QDBusConnection::disconnectFromPeer(name()); }

  bool isConnected() const { return _connection.isConnected(); }
  std::string lastError() const { return _connection.lastError().message().toStdString(); }
  bool send(const QDBusMessage& message) const { return _connection.send(message); }

  // What went wrong; nothing when the bus has answered.
  std::optional<std::string> ask(const char* method) const {
    const QDBusMessage question = QDBusMessage::createMethodCall(
        QStringLiteral("org.freedesktop.DBus"), QStringLiteral("/org/freedesktop/DBus"),
        QStringLiteral("org.freedesktop.DBus"), QString::fromLatin1(method));
    const QDBusMessage answer = _connection.call(question, QDBus::Block, replyTimeout);
    if (answer.type() == QDBusMessage::ReplyMessage) return std::nullopt;
    return answer.errorMessage().toStdString();
  }

 private:
  static QString name() { return QStringLiteral("varnel"); }

  QDBusConnection _connection;
};

}  // namespace

std::optional<std::string> sessionBusAddress() {
  if (const char* const address = std::getenv("DBUS_SESSION_BUS_ADDRESS"); address && *address)
    return address;
  const char* const folder = std::getenv("XDG_RUNTIME_DIR");
  if (!folder || !*folder) return std::nullopt;
  const auto socket = std::filesystem::path(folder) / "bus";
  std::error_code ignored;
  if (!std::filesystem::is_socket(socket, ignored)) return std::nullopt;
  return "unix:path=" + socket.string();
}

std::optional<std::string> sendBusSignal(const std::string& address, const BusSignal& signal) {
  const BusConnection bus(address);
  if (!bus.isConnected()) return bus.lastError();
  if (auto failure = bus.ask("Hello")) return failure;
  QDBusMessage message = QDBusMessage::createSignal(QString::fromStdString(signal.objectPath),
                                                    QString::fromStdString(signal.interface),
                                                    QString::fromStdString(signal.name));
  message.setArguments(signal.arguments);
  if (!bus.send(message)) return bus.lastError();
  return bus.ask("GetId");  // the bus answers after it has taken all that was sent before
}

}  // namespace varnel
