#pragma once

#include <QDBusArgument>
#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusMetaType>
#include <QDBusObjectPath>
#include <QDBusVirtualObject>
#include <QList>
#include <QMap>
#include <QVariantMap>
#include <cstdint>
#include <memory>
#include <mutex>
#include <string>
#include <utility>
#include <vector>

#include "tests/support/EventLoop.h"

namespace varnel {

/// A port as the service's property has it: name and type.
struct FakePort {
  QString name;
  std::uint32_t type = 0;
};

inline QDBusArgument& operator<<(QDBusArgument& argument, const FakePort& port) {
  argument.beginStructure();
  argument << port.name << port.type;
  argument.endStructure();
  return argument;
}
inline const QDBusArgument& operator>>(const QDBusArgument& argument, FakePort& port) {
  argument.beginStructure();
  argument >> port.name >> port.type;
  argument.endStructure();
  return argument;
}

}  // namespace varnel

Q_DECLARE_METATYPE(varnel::FakePort)

namespace varnel {

/// A service that speaks like ModemManager, with one modem. It has a thread and a bus connection of its own.
class FakeModemManager {
 public:
  struct Modem {
    std::string device = "/sys/devices/usb1/1-2";
    std::vector<std::pair<std::string, std::uint32_t>> ports;
    bool isInhibitionAllowed = true;
    bool answersInhibition = true;
  };

  FakeModemManager(const std::string& address, Modem modem)
      : _modem(std::move(modem)),
        _thread([this, address] { return std::make_shared<Service>(*this, address); }) {}

  /// Each call of InhibitDevice, such as "on /sys/devices/usb1/1-2", and "gone" when a program that inhibits
  /// has left the bus.
  std::vector<std::string> inhibitions() const {
    const std::lock_guard lock(_mutex);
    return _inhibitions;
  }

 private:
  using Interfaces = QMap<QString, QVariantMap>;
  using Objects = QMap<QDBusObjectPath, Interfaces>;

  class Service final : public QDBusVirtualObject {
   public:
    Service(FakeModemManager& fake, const std::string& address)
        : _fake(fake), _bus(QDBusConnection::connectToBus(QString::fromStdString(address), name())) {
      qDBusRegisterMetaType<FakePort>();
      qDBusRegisterMetaType<QList<FakePort>>();
      qDBusRegisterMetaType<Interfaces>();
      qDBusRegisterMetaType<Objects>();
      _bus.registerVirtualObject(QStringLiteral("/org/freedesktop/ModemManager1"), this,
                                 QDBusConnection::SubPath);
      _bus.registerService(QStringLiteral("org.freedesktop.ModemManager1"));
    }
    ~Service() override { QDBusConnection::disconnectFromBus(name()); }

    QString introspect(const QString& /*path*/) const override { return {}; }
    bool handleMessage(const QDBusMessage& message, const QDBusConnection& connection) override {
      if (message.member() == QStringLiteral("GetManagedObjects"))
        return connection.send(message.createReply(QVariant::fromValue(objects())));
      if (message.member() != QStringLiteral("InhibitDevice")) return false;
      if (!_fake._modem.isInhibitionAllowed)
        return connection.send(
            message.createErrorReply(QDBusError::AccessDenied, QStringLiteral("not allowed")));
      {
        const std::lock_guard lock(_fake._mutex);
        _fake._inhibitions.push_back((message.arguments().at(1).toBool() ? "on " : "off ") +
                                     message.arguments().at(0).toString().toStdString());
      }
      return !_fake._modem.answersInhibition || connection.send(message.createReply());
    }

   private:
    static QString name() { return QStringLiteral("fake-modem-manager"); }

    Objects objects() const {
      QList<FakePort> ports;
      for (const auto& [name, type] : _fake._modem.ports)
        ports.push_back({QString::fromStdString(name), type});
      QVariantMap modem;
      modem.insert(QStringLiteral("Device"), QString::fromStdString(_fake._modem.device));
      modem.insert(QStringLiteral("Ports"), QVariant::fromValue(ports));
      Interfaces interfaces;
      interfaces.insert(QStringLiteral("org.freedesktop.ModemManager1.Modem"), modem);
      interfaces.insert(QStringLiteral("org.freedesktop.ModemManager1.Modem.Simple"), {});
      Objects objects;
      objects.insert(QDBusObjectPath(QStringLiteral("/org/freedesktop/ModemManager1/Modem/0")), interfaces);
      return objects;
    }

    FakeModemManager& _fake;
    QDBusConnection _bus;
  };

  const Modem _modem;
  mutable std::mutex _mutex;
  std::vector<std::string> _inhibitions;
  PeerThread _thread;
};

}  // namespace varnel
