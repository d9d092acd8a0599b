#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "host/StreamReport.h"
#include "platform/MainQueue.h"
#include "platform/MessagePort.h"
#include "programs/varnel-telephonyd/CodeFilter.h"
#include "programs/varnel-telephonyd/Fault.h"
#include "programs/varnel-telephonyd/MessageCounts.h"
#include "programs/varnel-telephonyd/MessageSource.h"

namespace varnel {

/// What every log channel needs.
struct ChannelHost {
  MessagePorts& ports;
  MainQueue& queue;
  /// The time since some fixed moment. It never goes back.
  std::function<std::chrono::milliseconds()> uptime;
  /// The technology that viewers are told.
  std::string technology;
  /// Makes the messages of one channel, from the start of its stream.
  std::function<std::unique_ptr<MessageSource>()> makeSource;
  /// Gets every message that was sent.
  std::function<void(ByteView message)> messageSent;
  /// Tells the server's user one sentence.
  std::function<void(const std::string& sentence)> tell;
  Fault fault{};  ///< what goes wrong, for tests
};

/// The server's side of one log channel. It takes the viewer's commands on its own port, and sends the stream
/// at the stream's pace to the viewer's port. Sending never waits. When a viewer has no room, it gets time;
/// meanwhile messages of a source that does not wait are lost.
class ServedChannel final : public std::enable_shared_from_this<ServedChannel> {
 public:
  /// Takes ownership of the viewer's port, which has this name. The host must outlive the channel.
  ServedChannel(const ChannelHost& host, std::unique_ptr<RemotePort> viewer, std::string viewerPortName)
      : _host(host), _viewer(std::move(viewer)), _viewerPortName(std::move(viewerPortName)) {}

  const std::string& viewerPortName() const { return _viewerPortName; }

  /// Takes commands on a new port with this name. Calls the handler once when the viewer has gone away, has
  /// taken nothing for too long, or has given no command for ten seconds. The handler may release the
  /// channel. Returns false, without having begun, when the port cannot be made.
  bool open(const std::string& commandPortName, std::function<void()> ended);

  /// Checks whether the viewer is still there, and sends it a report if something is new.
  void checkViewer();
  /// Ends the channel as if the viewer had gone away.
  void end();

  /// Sends this sentence to the viewer with the next report.
  void note(const std::string& sentence) { _report.note = sentence; }
  MessageCounts counts() const;

  /// Sends nothing until `goOn`, but for what a seek sends. Not for a live stream.
  void pause();
  void goOn();
  /// Plays a stream that is not live this many times as fast as at speed 1.
  void setSpeed(double speed);
  /// Sends all messages before this place at once, from the start of the stream if the place was passed. Does
  /// nothing before the stream is started, and for a live stream.
  void seek(const StreamPlace& place);
  /// Where the stream is; absent before it is started, and for a live stream.
  std::optional<StreamPosition> position() const;
  /// Whether messages are sent at once because they are before the place of a seek.
  bool isSeeking() const { return _next && _source->isSeeking(); }

 private:
  enum class Delivery { Done, NoRoom, Ended };

  // The time of the stream stands still during a pause.
  std::chrono::milliseconds clock() const { return _pausedAt ? *_pausedAt : _host.uptime(); }
  std::chrono::milliseconds streamTime() const { return clock() - _startedAt; }

  std::optional<Bytes> takeCommand(ByteView data);
  std::optional<Bytes> answerTechnologyRequest();
  void start(CodeFilter filter);
  void sendWhatIsDue();
  void sendLater(std::chrono::milliseconds delay);
  Delivery deliver(ByteView message);
  Delivery waitForRoom();
  Delivery makeFault();
  Delivery refuseLength(std::size_t length);
  void takeNext();
  void noteWait();
  void countLost(std::uint64_t messages);
  void endWithoutCommand();
  void reportToViewer();

  const ChannelHost& _host;
  std::unique_ptr<RemotePort> _viewer;
  const std::string _viewerPortName;
  std::unique_ptr<LocalPort> _commands;
  std::function<void()> _ended;  // empty once it was called

  CodeFilter _filter;
  std::unique_ptr<MessageSource> _source;   // null until the stream is started
  std::optional<double> _speed;             // absent until one was set
  std::chrono::milliseconds _startedAt{0};  // the start of the stream; pauses and seeks move it
  std::optional<std::chrono::milliseconds> _pausedAt;
  std::uint64_t _turn = 0;  // the newest call that `sendLater` has put off
  std::optional<StreamMessage> _next;
  std::optional<std::chrono::milliseconds> _withoutRoomSince;

  bool _hasCommand = false;  // true once a command was understood
  bool _isReceived = false;  // true once the next message was due, and counted
  MessageCounts _counts;     // without those that wait in the source
  std::string _waitNote;     // of the source, as it was last
  std::string _endNote;      // of the source, that was sent last
  StreamReport _report;      // without the numbers
  StreamReport _sentReport;
};

}  // namespace varnel
