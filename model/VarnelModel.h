#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "LogGenerator/LogGenerator.h"
#include "base/WhileAlive.h"
#include "model/VarnelModelNode.h"
#include "platform/LinkReports.h"
#include "platform/MainQueue.h"
#include "platform/MessagePort.h"
#include "platform/TelephonyService.h"

namespace varnel {

/// Who shows what the model holds.
class VarnelModelObserver {
 public:
  virtual ~VarnelModelObserver() = default;
  /// New data has arrived: the tree is to be asked for again. Called from the main queue.
  virtual void updateViewControllerFromModel() = 0;
  /// The link to the telephony service was lost and has been started anew: `isConnected` may say otherwise
  /// than before, while the tree stays what it is.
  virtual void linkWasLost() {}
  /// The stream has started: `isConnected` says so, while the tree stays what it is until data arrives.
  virtual void linkWasOpened() {}
  /// The link was looked at and brought no data, or could not be opened: what is to be told of it may be
  /// another thing than before.
  virtual void linkWasLookedAt() {}
};

/// A display that no message changes any more, since a new link's generator cannot write to it.
struct StandingDisplay {
  std::string technology;  ///< whose display it is
  Time since;              ///< when the new link was opened
};

/// Why the stream did not start.
enum class StreamFailure {
  None,               ///< it did, or was not tried yet
  Link,               ///< there is no link to the telephony service
  NoTechnology,       ///< the service does not tell its technology
  UnknownTechnology,  ///< no generator is there for it
  Command,            ///< the start command could not be sent
};

/// What the model may ask of its host. Everything outlives the model.
struct ModelServices {
  MessagePorts& ports;
  TelephonyService& telephony;
  MainQueue& queue;
  Services generator;
  /// Serialises a command; nothing when it cannot.
  std::function<std::optional<Bytes>(const Value& command)> writePropertyList;
  /// What the host knows of the link; null when it knows nothing. The model itself does not ask.
  const LinkReports* linkReports = nullptr;
};

/// The link to the telephony service and the display tree made of what arrives on it.
///
/// It opens the log channel, asks which modem technology is present, has the matching generator, sends that
/// one's start command and from then on feeds it every message. Each failure tears the link down; the next
/// attempt follows five seconds later, without end. Everything happens on the main queue.
class VarnelModel {
 public:
  VarnelModel(const ModelServices& services, VarnelModelObserver& observer);
  VarnelModel(const VarnelModel&) = delete;
  VarnelModel& operator=(const VarnelModel&) = delete;
  ~VarnelModel();

  /// True while both ports exist.
  bool isConnected() const { return _recvPort && _sendPort; }
  /// Tears the link down and starts it anew.
  void restartMonitor();
  /// Has the main queue call `restartMonitor` once.
  void restartMonitorLater();
  /// Opens the link unless the stream runs; retries in five seconds when that fails.
  void startMonitor();
  /// Notices a service that has gone away, and has the observer updated when new data has arrived.
  void refresh();
  /// Folds one message of the log channel into the state.
  void updateWithData(ByteView data);

  /// The root of the display tree; null while there is no generator. Builds the tree when none is cached,
  /// which records a snapshot in the history.
  std::shared_ptr<const VarnelModelNode> topLevelNodes();
  /// The node of that path; null when there is none.
  std::shared_ptr<const VarnelModelNode> nodeAtPath(const std::string& path);
  /// What the save screen writes: an array of items; absent while there is no generator.
  Value getSaveContents() const;
  /// How many messages since the link was opened the binary log lacks because too many came at a time. They
  /// are shown all the same.
  std::uint64_t messagesLeftOutOfLog() const;

  /// How the last attempt to start the stream went.
  StreamFailure streamFailure() const { return _streamFailure; }
  /// The technology that the service named last, cut to 64 bytes; empty before it has named one.
  const std::string& technology() const { return _technology; }
  /// Absent while what arrives changes the display, and while there is none.
  const std::optional<StandingDisplay>& standingDisplay() const { return _standingDisplay; }
  /// True once a display has been made of what arrived.
  bool hasHistory() const;
  /// The file without which there is no display, when it could not be loaded; absent otherwise.
  std::optional<std::string> missingTemplate() const;
  /// How many messages since the link was opened no decoder took, because of their log code or length.
  std::uint64_t messagesNotDecoded() const;

 private:
  bool createPorts();
  bool createLocalPort();
  /// The name of the port that takes the channel's commands; nothing after a failure, which is logged.
  std::optional<std::string> createLogChannel();
  bool createRemotePort(const std::string& name);
  void destroyPorts();
  void configureGenerator();
  /// Nothing when there is no answer, which is logged.
  std::optional<Value> askForTechnology();
  bool startStream();
  StreamFailure failureToStart();
  void noteWhetherDisplayStands();
  void retryLater();
  void localPortWasInvalidated(const LocalPort* port);
  RemotePort::SendResult send(ByteView command, std::optional<std::chrono::milliseconds> replyTimeout);

  ModelServices _services;
  VarnelModelObserver& _observer;

  std::unique_ptr<LocalPort> _recvPort;
  std::unique_ptr<RemotePort> _sendPort;
  std::unique_ptr<RepeatingTimer> _displayUpdateTimer;
  bool _updated = false;
  StreamFailure _streamFailure = StreamFailure::None;
  std::string _technology;
  std::string _displayTechnology;  // that of the generator that made the display, or is to make it
  std::optional<StandingDisplay> _standingDisplay;
  std::unique_ptr<LogGenerator> _logGenerator;
  Dictionary _state;
  std::shared_ptr<const VarnelModelNode> _nodes;
  std::optional<PathDictionary> _nodesByPath;

  WhileAlive _whileAlive;
};

}  // namespace varnel
