#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "platform/MainQueue.h"
#include "platform/MessagePort.h"
#include "programs/varnel-telephonyd/CodeFilter.h"
#include "programs/varnel-telephonyd/MessageSource.h"

namespace varnel {

/// What every log channel is served from.
struct ChannelHost {
  MessagePorts& ports;
  MainQueue& queue;
  /// The time since any one moment; it never goes back.
  std::function<std::chrono::milliseconds()> uptime;
  /// What viewers are told that the modem is.
  std::string technology;
  /// Makes the messages of one channel, from the start of its stream on.
  std::function<std::unique_ptr<MessageSource>()> makeSource;
  /// Sees every message that was sent.
  std::function<void(ByteView message)> messageSent;
};

/// The server's side of one log channel: it takes the viewer's commands on a port of its own and sends the
/// stream, at its pace, to the viewer's port. A viewer that has no room is given time; sending never waits.
class ServedChannel final : public std::enable_shared_from_this<ServedChannel> {
 public:
  /// The viewer's port is owned from now on. The host outlives the channel.
  ServedChannel(const ChannelHost& host, std::unique_ptr<RemotePort> viewer)
      : _host(host), _viewer(std::move(viewer)) {}

  /// Takes commands on a new port of that name, and calls the handler once when the viewer has gone away or
  /// has taken nothing for too long; the handler may release the channel. False, with nothing begun, when the
  /// port cannot be made.
  bool open(const std::string& commandPortName, std::function<void()> ended);

  /// How many messages were left out so far because they are longer than the channel takes.
  std::uint64_t tooLongForChannel() const { return _tooLongForChannel; }

  /// Looks whether the viewer is still there.
  void checkViewer();

 private:
  enum class Delivery { Done, NoRoom, Ended };

  std::optional<Bytes> takeCommand(ByteView data);
  void start(CodeFilter filter);
  void sendWhatIsDue();
  void sendLater(std::chrono::milliseconds delay);
  bool fitsChannel(ByteView message);
  Delivery deliver(ByteView message);
  Delivery waitForRoom();
  void end();

  const ChannelHost& _host;
  std::unique_ptr<RemotePort> _viewer;
  std::unique_ptr<LocalPort> _commands;
  std::function<void()> _ended;  // empty once it was called

  CodeFilter _filter;
  std::unique_ptr<MessageSource> _source;  // null until the stream is started
  std::chrono::milliseconds _startedAt{0};
  std::optional<StreamMessage> _next;
  std::optional<std::chrono::milliseconds> _withoutRoomSince;
  std::uint64_t _tooLongForChannel = 0;
};

}  // namespace varnel
