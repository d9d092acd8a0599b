#include "widgets/DesktopColors.h"

#include <QApplication>
#include <QDBusMessage>
#include <QDBusPendingCallWatcher>
#include <QDBusPendingReply>
#include <QPalette>

namespace varnel {

namespace {

const QString service = QStringLiteral("org.freedesktop.portal.Desktop");
const QString objectPath = QStringLiteral("/org/freedesktop/portal/desktop");
const QString interface = QStringLiteral("org.freedesktop.portal.Settings");
const QString appearance = QStringLiteral("org.freedesktop.appearance");
const QString colorScheme = QStringLiteral("color-scheme");

const QString connectionName = QStringLiteral("varnel-colors");

QDBusMessage busMethod(const QString& name) {
  const QString bus = QStringLiteral("org.freedesktop.DBus");
  return QDBusMessage::createMethodCall(bus, QStringLiteral("/org/freedesktop/DBus"), bus, name);
}

// The number inside a variant, which may be inside other variants.
DesktopColors::Scheme schemeIn(QVariant value) {
  while (value.metaType() == QMetaType::fromType<QDBusVariant>())
    value = value.value<QDBusVariant>().variant();
  return static_cast<DesktopColors::Scheme>(value.toUInt());
}

// The style derives the palette's other colors from these.
QPalette darkPalette() {
  QPalette palette(QColor(48, 48, 48), QColor(36, 36, 36));
  palette.setColor(QPalette::Base, QColor(24, 24, 24));
  palette.setColor(QPalette::Highlight, QColor(53, 132, 228));
  palette.setColor(QPalette::HighlightedText, Qt::white);
  return palette;
}

}  // namespace

// A bus connection of the toolkit would wait for the bus. So this class connects to the bus as to any peer,
// and sends the first message itself.
DesktopColors::DesktopColors(const std::string& busAddress)
    : _bus(QDBusConnection::connectToPeer(QString::fromStdString(busAddress), connectionName)) {
  if (_bus.isConnected()) introduceItself();
}

DesktopColors::~DesktopColors() { QDBusConnection::disconnectFromPeer(connectionName); }

void DesktopColors::introduceItself() {
  auto* const watcher = new QDBusPendingCallWatcher(_bus.asyncCall(busMethod(QStringLiteral("Hello"))), this);
  connect(watcher, &QDBusPendingCallWatcher::finished, this, [this, watcher] {
    watcher->deleteLater();
    if (watcher->isError()) return;
    listen();
    ask();
  });
}

void DesktopColors::listen() {
  _bus.connect(QString(), objectPath, interface, QStringLiteral("SettingChanged"), this,
               SLOT(settingChanged(QString, QString, QDBusVariant)));
  QDBusMessage wish = busMethod(QStringLiteral("AddMatch"));
  wish << QStringLiteral(
              "type='signal',sender='%1',path='%2',interface='%3',member='SettingChanged',arg0='%4'")
              .arg(service, objectPath, interface, appearance);
  _bus.asyncCall(wish);
}

void DesktopColors::ask() {
  QDBusMessage question =
      QDBusMessage::createMethodCall(service, objectPath, interface, QStringLiteral("Read"));
  question << appearance << colorScheme;
  auto* const watcher = new QDBusPendingCallWatcher(_bus.asyncCall(question), this);
  connect(watcher, &QDBusPendingCallWatcher::finished, this, [watcher] {
    watcher->deleteLater();
    const QDBusPendingReply<QDBusVariant> reply = *watcher;
    if (!reply.isError()) apply(schemeIn(reply.value().variant()));
  });
}

void DesktopColors::settingChanged(const QString& group, const QString& key, const QDBusVariant& value) {
  if (group == appearance && key == colorScheme) apply(schemeIn(value.variant()));
}

void DesktopColors::apply(Scheme scheme) {
  // Restores the toolkit's own palette, which may be dark already.
  QApplication::setPalette(QPalette());
  constexpr int halfLight = 128;
  const bool isDark = QApplication::palette().color(QPalette::Window).lightness() < halfLight;
  if (scheme == Scheme::Dark && !isDark) QApplication::setPalette(darkPalette());
}

}  // namespace varnel
