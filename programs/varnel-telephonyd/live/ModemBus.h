#pragma once

#include <QDBusConnection>
#include <QDBusMessage>
#include <QObject>
#include <QString>
#include <QVariantList>
#include <QVariantMap>
#include <chrono>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "platform/MainQueue.h"
#include "programs/varnel-telephonyd/live/BusReading.h"

class QDBusPendingCallWatcher;
class QDBusServiceWatcher;

namespace varnel {

/// The connection to ModemManager on the system bus. No call waits for its answer. A bus that goes away is
/// connected again as soon as it is back. The service is never started by this program: its user may have
/// stopped it.
class ModemBus final : public QObject {
  Q_OBJECT

 public:
  enum class Service : std::uint8_t { NoBus, NotRunning, NotAnswering, Running };

  struct Handlers {
    /// The service has come or gone. When it runs, these are all of its objects.
    std::function<void(Service service, const busReading::Objects& objects)> serviceChanged;
    std::function<void(const std::string& object, const busReading::Interfaces& interfaces)> added;
    /// An object has gone, or at least its interface of a modem.
    std::function<void(const std::string& object)> removed;
    std::function<void(const std::string& object, const QString& interface, const QVariantMap& properties)>
        changed;
  };
  /// Gets the answer, which may be an error. Never called after the service or the bus has gone, nor after
  /// `ModemBus`.
  using Answer = std::function<void(const QDBusMessage& answer)>;

  /// The answer of a call that takes longer than the patience is an error.
  ModemBus(MainQueue& queue, std::chrono::milliseconds patience, Handlers handlers);
  ~ModemBus() override;

  /// Connects, and calls the handlers from now on.
  void start();
  /// Calls a method. Returns false, and calls nothing, when there is no
  /// bus, or when the service has not answered many earlier calls.
  bool call(const std::string& object, const QString& interface, const char* method,
            const QVariantList& arguments, Answer answer);
  /// Asks for all properties of an interface.
  bool getAll(const std::string& object, const QString& interface, Answer answer);
  /// The calls that have no answer yet.
  std::size_t openCalls() const { return _open.size(); }

 private:
  void connectToBus();
  void disconnectFromBus();
  void checkBus();
  void listen();
  void takeOwner(bool isOwned);
  void askForObjects();
  void send(const QDBusMessage& message, Answer answer);
  void tell(Service service, const busReading::Objects& objects = {});
  Q_SLOT void takeAdded(const QDBusMessage& message);
  Q_SLOT void takeRemoved(const QDBusMessage& message);
  Q_SLOT void takeChanged(const QDBusMessage& message);

  MainQueue& _queue;
  const std::chrono::milliseconds _patience;
  const Handlers _handlers;
  const QString _name;  // of the connection
  QDBusConnection _bus;
  std::unique_ptr<QDBusServiceWatcher> _watcher;
  std::unique_ptr<RepeatingTimer> _busCheck;
  bool _isConnected = false;
  bool _hasAnswered = false;  // the service has told its objects
  std::uint64_t _life = 0;    // counts the lives of the service; answers of an earlier one are dropped
  using Call = std::unique_ptr<QDBusPendingCallWatcher>;
  std::map<QDBusPendingCallWatcher*, Call> _open;           // calls that have no answer yet
  std::vector<Call> _finished;                              // those that have, until the next call
  std::shared_ptr<bool> _guard = std::make_shared<bool>();  // for tasks that may run after this object
};

}  // namespace varnel
