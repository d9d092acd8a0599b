#include "programs/varnel-telephonyd/live/ModemBus.h"

#include <QDBusArgument>
#include <QDBusObjectPath>
#include <QDBusPendingCallWatcher>
#include <QDBusServiceWatcher>
#include <QStringList>
#include <utility>

#include "programs/varnel-telephonyd/live/ModemInterfaces.h"

namespace varnel {

using namespace std::chrono_literals;

namespace {

const QString service = QStringLiteral("org.freedesktop.ModemManager1");
const QString rootPath = QStringLiteral("/org/freedesktop/ModemManager1");
const QString objectManager = QStringLiteral("org.freedesktop.DBus.ObjectManager");
const QString properties = QStringLiteral("org.freedesktop.DBus.Properties");

constexpr std::chrono::milliseconds busInterval = 5s;
// A service that takes this many calls without an answer gets no more.
constexpr std::size_t mostOpenCalls = 64;

QString nameOfNext() {
  static int count = 0;
  return QStringLiteral("varnel-live-%1").arg(++count);
}

bool hasSignature(const QDBusMessage& message, const char* signature) {
  return message.signature() == QString::fromLatin1(signature);
}

}  // namespace

ModemBus::ModemBus(MainQueue& queue, std::chrono::milliseconds patience, Handlers handlers)
    : _queue(queue), _patience(patience), _handlers(std::move(handlers)), _name(nameOfNext()), _bus(_name) {}

ModemBus::~ModemBus() { disconnectFromBus(); }

void ModemBus::start() {
  _busCheck = _queue.repeating(busInterval, [this] { checkBus(); });
  connectToBus();
}

void ModemBus::connectToBus() {
  _bus = QDBusConnection::connectToBus(QDBusConnection::SystemBus, _name);
  _isConnected = _bus.isConnected();
  if (!_isConnected) {
    disconnectFromBus();
    return tell(Service::NoBus);
  }
  listen();
  QDBusMessage question =
      QDBusMessage::createMethodCall(QStringLiteral("org.freedesktop.DBus"), QStringLiteral("/"),
                                     QStringLiteral("org.freedesktop.DBus"), QStringLiteral("NameHasOwner"));
  question << service;
  send(question, [this](const QDBusMessage& answer) { takeOwner(answer.arguments().value(0).toBool()); });
}

// A finished call is inside its own signal, so it is kept until the next one.
void ModemBus::send(const QDBusMessage& message, Answer answer) {
  _finished.clear();
  auto call =
      std::make_unique<QDBusPendingCallWatcher>(_bus.asyncCall(message, static_cast<int>(_patience.count())));
  QDBusPendingCallWatcher* const watcher = call.get();
  _open.emplace(watcher, std::move(call));
  connect(watcher, &QDBusPendingCallWatcher::finished, this,
          [this, watcher, answer = std::move(answer), life = _life] {
            // A bus that has gone makes errors of its own.
            if (life == _life && _bus.isConnected()) answer(watcher->reply());
            _finished.push_back(std::move(_open.extract(watcher).mapped()));
          });
}

void ModemBus::disconnectFromBus() {
  _watcher.reset();
  _isConnected = false;
  _hasAnswered = false;
  ++_life;
  QDBusConnection::disconnectFromBus(_name);
}

void ModemBus::checkBus() {
  if (_isConnected && _bus.isConnected()) return;
  if (_isConnected) {
    disconnectFromBus();
    tell(Service::NoBus);
  }
  connectToBus();
}

void ModemBus::listen() {
  _watcher = std::make_unique<QDBusServiceWatcher>(service, _bus, QDBusServiceWatcher::WatchForOwnerChange);
  connect(_watcher.get(), &QDBusServiceWatcher::serviceOwnerChanged, this,
          [this](const QString&, const QString&, const QString& owner) { takeOwner(!owner.isEmpty()); });
  _bus.connect(service, rootPath, objectManager, QStringLiteral("InterfacesAdded"), this,
               SLOT(takeAdded(QDBusMessage)));
  _bus.connect(service, rootPath, objectManager, QStringLiteral("InterfacesRemoved"), this,
               SLOT(takeRemoved(QDBusMessage)));
  // Of any object.
  _bus.connect(service, QString(), properties, QStringLiteral("PropertiesChanged"), this,
               SLOT(takeChanged(QDBusMessage)));
}

// A service that is replaced by another one begins anew.
void ModemBus::takeOwner(bool isOwned) {
  ++_life;
  const bool hadAnswered = std::exchange(_hasAnswered, false);
  if (!isOwned || hadAnswered) tell(Service::NotRunning);
  if (isOwned) askForObjects();
}

void ModemBus::askForObjects() {
  call(rootPath.toStdString(), objectManager, "GetManagedObjects", {}, [this](const QDBusMessage& answer) {
    const auto objects = busReading::objectsOf(answer);
    _hasAnswered = objects.has_value();
    if (_hasAnswered) return tell(Service::Running, *objects);
    tell(Service::NotAnswering);
    _queue.after(busInterval, [this, life = _life, guard = std::weak_ptr(_guard)] {
      if (!guard.expired() && life == _life && !_hasAnswered) askForObjects();
    });
  });
}

void ModemBus::tell(Service service, const busReading::Objects& objects) {
  _handlers.serviceChanged(service, objects);
}

bool ModemBus::call(const std::string& object, const QString& interface, const char* method,
                    const QVariantList& arguments, Answer answer) {
  if (!_isConnected || _open.size() >= mostOpenCalls) return false;
  QDBusMessage message = QDBusMessage::createMethodCall(service, QString::fromStdString(object), interface,
                                                        QString::fromLatin1(method));
  message.setArguments(arguments);
  message.setAutoStartService(false);
  send(message, std::move(answer));
  return true;
}

bool ModemBus::getAll(const std::string& object, const QString& interface, Answer answer) {
  return call(object, properties, "GetAll", {interface}, std::move(answer));
}

void ModemBus::takeAdded(const QDBusMessage& message) {
  if (!_hasAnswered || !hasSignature(message, "oa{sa{sv}}")) return;
  const auto object = message.arguments().value(0).value<QDBusObjectPath>().path();
  busReading::Interfaces interfaces;
  message.arguments().value(1).value<QDBusArgument>() >> interfaces;
  _handlers.added(object.toStdString(), interfaces);
}

void ModemBus::takeRemoved(const QDBusMessage& message) {
  if (!_hasAnswered || !hasSignature(message, "oas")) return;
  if (!message.arguments().value(1).toStringList().contains(modemInterfaces::modem)) return;
  _handlers.removed(message.arguments().value(0).value<QDBusObjectPath>().path().toStdString());
}

void ModemBus::takeChanged(const QDBusMessage& message) {
  if (!_hasAnswered || !hasSignature(message, "sa{sv}as")) return;
  const auto changed = qdbus_cast<QVariantMap>(message.arguments().value(1));
  _handlers.changed(message.path().toStdString(), message.arguments().value(0).toString(), changed);
}

}  // namespace varnel
