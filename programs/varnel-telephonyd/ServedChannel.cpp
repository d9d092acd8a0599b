#include "programs/varnel-telephonyd/ServedChannel.h"

#include <utility>

#include "base/Log.h"
#include "host/PortFrame.h"
#include "programs/varnel-telephonyd/ChannelCommand.h"

namespace varnel {

namespace {

using namespace std::chrono_literals;

// Then everybody else gets a turn.
constexpr int messagesAtATime = 64;
constexpr std::chrono::milliseconds retryInterval = 20ms;
constexpr std::chrono::milliseconds patience = 5s;
// A capture that is played over and over must not fill the log.
constexpr std::uint64_t mostNamedAsTooLong = 10;

}  // namespace

bool ServedChannel::open(const std::string& commandPortName, std::function<void()> ended) {
  auto creation = _host.ports.createLocalPort(
      commandPortName, [this](std::int32_t identifier, ByteView data) -> std::optional<Bytes> {
        return identifier == 0 ? takeCommand(data) : std::nullopt;
      });
  if (!creation.port) return false;
  _commands = std::move(creation.port);
  _ended = std::move(ended);
  _commands->setInvalidationHandler([this] { end(); });
  _commands->deliverOnMainQueue();
  return true;
}

void ServedChannel::checkViewer() {
  if (!_viewer->isValid()) end();
}

std::optional<Bytes> ServedChannel::takeCommand(ByteView data) {
  const auto command = readChannelCommand(data);
  if (!command) {
    logWarning("A command of %ld bytes cannot be understood", data.size());
    return std::nullopt;
  }
  if (std::holds_alternative<TechnologyRequest>(*command)) return technologyReply(_host.technology);
  start(std::get<StartRequest>(*command).filter);
  return std::nullopt;
}

// A stream that runs already goes on, with other codes.
void ServedChannel::start(CodeFilter filter) {
  _filter = std::move(filter);
  if (_source) return;
  _source = _host.makeSource();
  _startedAt = _host.uptime();
  _next = _source->next();
  sendLater(0ms);
}

void ServedChannel::sendWhatIsDue() {
  for (int count = 0; count < messagesAtATime; ++count) {
    if (!_next) return;
    const auto wait = _startedAt + _next->at - _host.uptime();
    if (wait.count() > 0) return sendLater(wait);
    if (_filter.takes(_next->bytes) && fitsChannel(_next->bytes)) {
      const Delivery delivery = deliver(_next->bytes);
      if (delivery == Delivery::NoRoom) return sendLater(retryInterval);
      if (delivery == Delivery::Ended) return end();
    }
    _next = _source->next();
  }
  sendLater(0ms);
}

void ServedChannel::sendLater(std::chrono::milliseconds delay) {
  _host.queue.after(delay, [weak = weak_from_this()] {
    if (const auto channel = weak.lock()) channel->sendWhatIsDue();
  });
}

// The transport would take the connection of one that does not for broken.
bool ServedChannel::fitsChannel(ByteView message) {
  if (message.size() <= maximumPayload) return true;
  if (++_tooLongForChannel <= mostNamedAsTooLong)
    logError("%s is left out: it has %ld bytes, and the channel takes %ld", _source->nameOfLast(),
             message.size(), maximumPayload);
  return false;
}

ServedChannel::Delivery ServedChannel::deliver(ByteView message) {
  const std::int32_t status = _viewer->sendRequest(0, message, 0ms, std::nullopt).status;
  if (status == RemotePort::sendTimeout) return waitForRoom();
  if (status != 0) {
    logLine(logNoticePriority, "The viewer has gone away (status %d)", status);
    return Delivery::Ended;
  }
  _withoutRoomSince.reset();
  _host.messageSent(message);
  return Delivery::Done;
}

ServedChannel::Delivery ServedChannel::waitForRoom() {
  const auto now = _host.uptime();
  if (!_withoutRoomSince) _withoutRoomSince = now;
  if (now - *_withoutRoomSince < patience) return Delivery::NoRoom;
  logError("A viewer that does not read is dropped");
  return Delivery::Ended;
}

void ServedChannel::end() {
  _next.reset();
  // The last deed: it may release this channel.
  if (const auto ended = std::exchange(_ended, nullptr)) ended();
}

}  // namespace varnel
