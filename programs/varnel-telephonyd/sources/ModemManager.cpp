#include "programs/varnel-telephonyd/sources/ModemManager.h"

#include <QDBusArgument>
#include <QDBusMessage>
#include <QDBusObjectPath>
#include <QMap>
#include <QString>
#include <QVariantMap>
#include <algorithm>
#include <chrono>
#include <cstdint>
#include <string_view>
#include <utility>

namespace varnel {

using namespace std::chrono_literals;

namespace {

constexpr const char* connectionName = "varnel-modem-manager";
const QString service = QStringLiteral("org.freedesktop.ModemManager1");
const QString path = QStringLiteral("/org/freedesktop/ModemManager1");
const QString objectManager = QStringLiteral("org.freedesktop.DBus.ObjectManager");
const QString modemInterface = QStringLiteral("org.freedesktop.ModemManager1.Modem");

// In the service's enumeration of port types.
constexpr std::uint32_t diagnosticPort = 4;  // diagnostic port

constexpr std::size_t mostPorts = 256, longestName = 100;

using Interfaces = QMap<QString, QVariantMap>;

// A name below /dev, such as "ttyUSB0".
bool isName(std::string_view name) {
  const auto isPlain = [](char letter) {
    return (letter >= '0' && letter <= '9') || (letter >= 'A' && letter <= 'Z') ||
           (letter >= 'a' && letter <= 'z') || letter == '_' || letter == '-' || letter == '/';
  };
  return !name.empty() && name.size() <= longestName && std::ranges::all_of(name, isPlain);
}

// The property is an array of (name, type).
void appendPorts(std::vector<ModemManager::Port>& ports, const QVariantMap& modem) {
  const auto device = modem.value(QStringLiteral("Device")).toString().toStdString();
  const QVariant property = modem.value(QStringLiteral("Ports"));
  if (!property.canConvert<QDBusArgument>()) return;
  const auto list = property.value<QDBusArgument>();
  if (list.currentSignature() != QStringLiteral("a(su)")) return;
  list.beginArray();
  while (!list.atEnd()) {
    QString name;
    std::uint32_t type = 0;
    list.beginStructure();
    list >> name >> type;
    list.endStructure();
    if (ports.size() < mostPorts && isName(name.toStdString()))
      ports.push_back({"/dev/" + name.toStdString(), device, type == diagnosticPort});
  }
  list.endArray();
}

std::vector<ModemManager::Port> portsIn(const QDBusArgument& objects) {
  std::vector<ModemManager::Port> ports;
  objects.beginMap();
  while (!objects.atEnd()) {
    QDBusObjectPath object;
    Interfaces interfaces;
    objects.beginMapEntry();
    objects >> object >> interfaces;
    objects.endMapEntry();
    if (interfaces.contains(modemInterface)) appendPorts(ports, interfaces.value(modemInterface));
  }
  objects.endMap();
  return ports;
}

// Does not start the service: its user may have stopped it for the port's sake.
QDBusMessage callTo(const QString& interface, const char* method) {
  QDBusMessage call = QDBusMessage::createMethodCall(service, path, interface, QString::fromLatin1(method));
  call.setAutoStartService(false);
  return call;
}

QDBusMessage inhibitDevice(const std::string& modem, bool isInhibited) {
  QDBusMessage call = callTo(service, "InhibitDevice");
  call << QString::fromStdString(modem) << isInhibited;
  return call;
}

}  // namespace

ModemManager::ModemManager(std::chrono::milliseconds patience)
    : _bus(QDBusConnection::connectToBus(QDBusConnection::SystemBus, QString::fromLatin1(connectionName))),
      _patience(patience) {}

ModemManager::~ModemManager() {
  release();
  QDBusConnection::disconnectFromBus(QString::fromLatin1(connectionName));
}

std::optional<std::vector<ModemManager::Port>> ModemManager::ports() {
  if (!_bus.isConnected()) return std::nullopt;
  const QDBusMessage answer = answerTo(callTo(objectManager, "GetManagedObjects"));
  if (answer.type() != QDBusMessage::ReplyMessage || answer.signature() != QStringLiteral("a{oa{sa{sv}}}"))
    return std::nullopt;
  return portsIn(answer.arguments().value(0).value<QDBusArgument>());
}

std::optional<std::string> ModemManager::inhibit(const std::string& modem) {
  release();
  _inhibited = modem;
  const QDBusMessage answer = answerTo(inhibitDevice(modem, true));
  if (answer.type() == QDBusMessage::ReplyMessage) return std::nullopt;
  release();  // the service may still do it when the time is over
  return "ModemManager does not leave the modem alone (" + answer.errorMessage().toStdString() +
         "); start the server with sudo, or allow it to a service with the rule of polkit in "
         "varnel-telephonyd(8), or type sudo systemctl stop ModemManager";
}

void ModemManager::release() {
  if (_inhibited.empty()) return;
  const std::string modem = std::exchange(_inhibited, {});
  answerTo(inhibitDevice(modem, false));
}

QDBusMessage ModemManager::answerTo(const QDBusMessage& call) {
  const auto start = std::chrono::steady_clock::now();
  // Without patience the call is made all the same.
  QDBusMessage answer = _bus.call(call, QDBus::Block, static_cast<int>(std::max(_patience, 1ms).count()));
  const auto passed = std::chrono::steady_clock::now() - start;
  _patience -= std::chrono::duration_cast<std::chrono::milliseconds>(passed);
  return answer;
}

}  // namespace varnel
