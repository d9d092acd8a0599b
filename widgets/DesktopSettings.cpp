#include "widgets/DesktopSettings.h"

#include <QDBusMessage>
#include <QDBusPendingCallWatcher>
#include <QDBusPendingReply>
#include <QSet>
#include <utility>

namespace varnel {

namespace {

const QString service = QStringLiteral("org.freedesktop.portal.Desktop");
const QString objectPath = QStringLiteral("/org/freedesktop/portal/desktop");
const QString interface = QStringLiteral("org.freedesktop.portal.Settings");

const QString connectionName = QStringLiteral("varnel-settings");

QDBusMessage busMethod(const QString& name) {
  const QString bus = QStringLiteral("org.freedesktop.DBus");
  return QDBusMessage::createMethodCall(bus, QStringLiteral("/org/freedesktop/DBus"), bus, name);
}

// What is inside a variant, which may be inside other variants.
QVariant contentOf(QVariant value) {
  while (value.metaType() == QMetaType::fromType<QDBusVariant>())
    value = value.value<QDBusVariant>().variant();
  return value;
}

}  // namespace

// A bus connection of the toolkit would wait for the bus. So this class connects to the bus as to any peer,
// and sends the first message itself.
DesktopSettings::DesktopSettings(const std::string& busAddress, std::vector<Setting> settings)
    : _bus(QDBusConnection::connectToPeer(QString::fromStdString(busAddress), connectionName)),
      _settings(std::move(settings)) {
  if (_bus.isConnected()) introduceItself();
}

DesktopSettings::~DesktopSettings() { QDBusConnection::disconnectFromPeer(connectionName); }

void DesktopSettings::introduceItself() {
  auto* const watcher = new QDBusPendingCallWatcher(_bus.asyncCall(busMethod(QStringLiteral("Hello"))), this);
  connect(watcher, &QDBusPendingCallWatcher::finished, this, [this, watcher] {
    watcher->deleteLater();
    if (watcher->isError()) return;
    listen();
    for (const Setting& setting : _settings) ask(setting);
  });
}

void DesktopSettings::listen() {
  _bus.connect(QString(), objectPath, interface, QStringLiteral("SettingChanged"), this,
               SLOT(settingChanged(QString, QString, QDBusVariant)));
  QSet<QString> groups;
  for (const Setting& setting : _settings) groups.insert(setting.group);
  for (const QString& group : groups) {
    QDBusMessage wish = busMethod(QStringLiteral("AddMatch"));
    wish << QStringLiteral(
                "type='signal',sender='%1',path='%2',interface='%3',member='SettingChanged',arg0='%4'")
                .arg(service, objectPath, interface, group);
    _bus.asyncCall(wish);
  }
}

void DesktopSettings::ask(const Setting& setting) {
  QDBusMessage question =
      QDBusMessage::createMethodCall(service, objectPath, interface, QStringLiteral("Read"));
  question << setting.group << setting.key;
  auto* const watcher = new QDBusPendingCallWatcher(_bus.asyncCall(question), this);
  connect(watcher, &QDBusPendingCallWatcher::finished, this, [watcher, follow = setting.follow] {
    watcher->deleteLater();
    const QDBusPendingReply<QDBusVariant> reply = *watcher;
    if (!reply.isError()) follow(contentOf(reply.value().variant()));
  });
}

void DesktopSettings::settingChanged(const QString& group, const QString& key, const QDBusVariant& value) {
  for (const Setting& setting : _settings) {
    if (setting.group == group && setting.key == key) setting.follow(contentOf(value.variant()));
  }
}

}  // namespace varnel
