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

/// Shows what the model holds.
class VarnelModelObserver {
 public:
  virtual ~VarnelModelObserver() = default;
  /// New data has arrived, so the observer should ask for the tree again. Called from the main queue.
  virtual void updateViewControllerFromModel() = 0;
  /// The link to the telephony service was lost, and the model has started it again. `isConnected` may have
  /// changed; the tree has not.
  virtual void linkWasLost() {}
  /// The stream has started, so `isConnected` is true. The tree does not change until data arrives.
  virtual void linkWasOpened() {}
  /// The model has checked the link, and no data has arrived; or it could not open the link. The state of
  /// the link may have changed.
  virtual void linkWasLookedAt() {}
};

/// A display that no message changes any more, since the generator of a new link cannot write to it.
struct StandingDisplay {
  std::string technology;  ///< the technology of the display
  Time since;              ///< when the new link was opened
};

/// Why the stream did not start.
enum class StreamFailure {
  None,               ///< the stream did start, or was not tried yet
  Link,               ///< there is no link to the telephony service
  NoTechnology,       ///< the service does not tell the technology of its modem
  UnknownTechnology,  ///< there is no generator for the technology
  Command,            ///< the start command could not be sent
};

/// What the model needs from its host. Every object in it must outlive the model.
struct ModelServices {
  MessagePorts& ports;
  TelephonyService& telephony;
  MainQueue& queue;
  Services generator;
  /// Writes a command as a property list; nothing when that is not possible.
  std::function<std::optional<Bytes>(const Value& command)> writePropertyList;
  /// Reports about the link; null when the host has none. The model itself does not use them.
  const LinkReports* linkReports = nullptr;
};

/// The link to the telephony service, and the display tree made of what arrives on it.
///
/// The model opens the log channel, asks for the modem technology, makes the generator for it, and sends the
/// generator's start command. From then on it gives the generator every message. After each failure it closes
/// the link and tries again five seconds later, without end. Everything happens on the main queue.
class VarnelModel {
 public:
  VarnelModel(const ModelServices& services, VarnelModelObserver& observer);
  VarnelModel(const VarnelModel&) = delete;
  VarnelModel& operator=(const VarnelModel&) = delete;
  ~VarnelModel();

  /// True while both ports exist.
  bool isConnected() const { return _recvPort && _sendPort; }
  /// Closes the link and starts it again.
  void restartMonitor();
  /// Calls `restartMonitor` once, from the main queue.
  void restartMonitorLater();
  /// Opens the link unless the stream runs. Tries again in five seconds when that fails.
  void startMonitor();
  /// Notices that the service has gone away. Updates the observer when new data has arrived.
  void refresh();
  /// Shows this display in place of one that is made of messages. For a model whose link was not started.
  void showDisplay(const Value& display);
  /// Gives the generator one message of the log channel, whole, which changes the state.
  void updateWithData(ByteView data);

  /// The root of the display tree; null while there is no generator. If no tree is cached, builds one, and
  /// adds a snapshot record to the history.
  std::shared_ptr<const VarnelModelNode> topLevelNodes();
  /// The node with this path; null when there is none.
  std::shared_ptr<const VarnelModelNode> nodeAtPath(const std::string& path);
  /// The display of which the tree is made; absent while there is none.
  const Value& display() const { return _state.get(stateKey::display); }
  /// The items that the save screen writes, as an array; absent while there is no generator.
  Value getSaveContents() const;
  /// How many messages the binary log lacks since the link was opened, because too many came at a time. They
  /// are shown nevertheless.
  std::uint64_t messagesLeftOutOfLog() const;

  /// The result of the last attempt to start the stream.
  StreamFailure streamFailure() const { return _streamFailure; }
  /// The last technology that the service named, cut to 64 bytes; empty before it has named one.
  const std::string& technology() const { return _technology; }
  /// Absent while messages change the display, and while there is no display.
  const std::optional<StandingDisplay>& standingDisplay() const { return _standingDisplay; }
  /// True after a display was made from messages.
  bool hasHistory() const;
  /// The template file, when it could not be loaded and so there is no display; absent otherwise.
  std::optional<std::string> missingTemplate() const;
  /// The formats of the display's numbers; none while there is no generator. They are made anew by each call.
  NumberFormats numberFormats() const;
  /// How many messages since the link was opened no decoder took, because of their log code, version, or
  /// length.
  std::uint64_t messagesNotDecoded() const;

 private:
  bool createPorts();
  bool createLocalPort();
  /// The name of the port that takes the channel's commands. On failure logs why and returns nothing.
  std::optional<std::string> createLogChannel();
  bool createRemotePort(const std::string& name);
  void destroyPorts();
  void configureGenerator();
  /// The technology that the service names. Without an answer logs why and returns nothing.
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
  std::string _displayTechnology;  // of the generator that made the display, or is going to make it
  std::optional<StandingDisplay> _standingDisplay;
  std::unique_ptr<LogGenerator> _logGenerator;
  Dictionary _state;
  std::shared_ptr<const VarnelModelNode> _nodes;
  std::optional<PathDictionary> _nodesByPath;

  WhileAlive _whileAlive;
};

}  // namespace varnel
