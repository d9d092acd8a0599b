#include "programs/varnel-telephonyd/ServedChannel.h"

#include <thread>
#include <utility>

#include "base/Log.h"
#include "base/PropertyList.h"
#include "host/PortFrame.h"
#include "host/TelephonyProtocol.h"
#include "programs/varnel-telephonyd/ChannelCommand.h"

namespace varnel {

namespace {

using namespace std::chrono_literals;

// After this many, other channels get a turn.
constexpr int messagesAtATime = 1024;
constexpr std::chrono::milliseconds retryInterval = 20ms;
constexpr std::chrono::milliseconds patience = 5s;
// A capture that is played again and again must not fill the log.
constexpr std::uint64_t mostNamedAsTooLong = 10;
constexpr std::chrono::milliseconds commandPatience = 10s;
// A live message is shown within this time or not at all.
constexpr std::chrono::milliseconds longestDelay = 1s;
// Of a reply that is late on purpose. A viewer waits for one second.
constexpr std::chrono::milliseconds lateness = 2s;

// Bytes that are neither a packet nor a property list.
Bytes garbage() {
  Bytes bytes(256);
  for (std::size_t i = 0; i < bytes.size(); ++i) bytes[i] = static_cast<std::uint8_t>(0x5A + 37 * i);
  return bytes;
}

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
  _host.queue.after(commandPatience, [weak = weak_from_this()] {
    if (const auto channel = weak.lock()) channel->endWithoutCommand();
  });
  return true;
}

void ServedChannel::endWithoutCommand() {
  if (_hasCommand) return;
  logWarning("A log channel gets no command and is closed");
  end();
}

void ServedChannel::checkViewer() {
  if (!_viewer->isValid()) return end();
  reportToViewer();
}

void ServedChannel::reportToViewer() {
  StreamReport report = _report;
  report.dropped = _counts.dropped;
  report.tooLong = _counts.tooLong;
  if (report == _sentReport) return;
  // If there is no room, the report is sent at a later check.
  const auto sent = _viewer->sendRequest(telephonyProtocol::streamReportIdentifier, writeStreamReport(report),
                                         0ms, std::nullopt);
  if (sent.status == 0) _sentReport = std::move(report);
}

std::optional<Bytes> ServedChannel::takeCommand(ByteView data) {
  const auto command = readChannelCommand(data);
  if (!command) {
    logWarning("A command of %ld bytes cannot be understood", data.size());
    return std::nullopt;
  }
  _hasCommand = true;
  if (std::holds_alternative<TechnologyRequest>(*command)) return answerTechnologyRequest();
  start(std::get<StartRequest>(*command).filter);
  return std::nullopt;
}

std::optional<Bytes> ServedChannel::answerTechnologyRequest() {
  switch (_host.fault.kind) {
    case Fault::Kind::Silent:
      return std::nullopt;
    case Fault::Kind::LateReply:
      std::this_thread::sleep_for(lateness);
      break;
    case Fault::Kind::BadReply:
      return garbage();
    case Fault::Kind::EmptyReply:
      return writeXmlPropertyList(Value::ofDictionary());
    case Fault::Kind::UnknownTechnology:
      return technologyReply("of-no-modem");
    case Fault::Kind::DropAfterReply: {
      // The port sends the reply before it closes.
      Bytes reply = technologyReply(_host.technology);
      const auto self = shared_from_this();
      end();
      return reply;
    }
    default:
      break;
  }
  return technologyReply(_host.technology);
}

// If the stream already runs, it goes on with the new codes.
void ServedChannel::start(CodeFilter filter) {
  _filter = std::move(filter);
  if (_source) return _source->setFilter(_filter);
  _source = _host.makeSource();
  _startedAt = _host.uptime();
  if (_pausedAt) _pausedAt = _startedAt;
  if (_speed) _source->setSpeed(*_speed, 0ms);
  _source->setFilter(_filter);
  _source->setNewsHandler([this] {
    if (_next || !_ended) return;
    takeNext();
    sendLater(0ms);
  });
  takeNext();
  sendLater(0ms);
}

void ServedChannel::sendWhatIsDue() {
  for (int count = 0; count < messagesAtATime; ++count) {
    if (!_next || (_pausedAt && !_source->isSeeking())) return;
    const auto wait = _next->at - streamTime();
    if (wait.count() > 0) return sendLater(wait);
    if (!std::exchange(_isReceived, true)) ++_counts.received;
    const Delivery delivery = deliver(_next->bytes);
    if (delivery == Delivery::NoRoom) {
      countLost(_source->takeLost());
      return sendLater(retryInterval);
    }
    if (delivery == Delivery::Ended) return end();
    takeNext();
  }
  sendLater(0ms);
}

void ServedChannel::takeNext() {
  _isReceived = false;
  const bool isEndTold = _source->isEndTold();
  const bool wasSeeking = _source->isSeeking();
  _next = _source->next();
  // The stream goes on from here now, however long the seek has taken.
  if (wasSeeking && !_source->isSeeking() && _next) _startedAt = clock() - _next->at;
  countLost(_source->takeLost());
  noteWait();
  if (_next || _source->isWaiting()) return;
  const std::string sentence = _source->endNote();
  if (sentence.empty()) return;
  _endNote = sentence;
  note(sentence);
  if (!isEndTold) _host.tell(sentence);
}

// A note about something else stays.
void ServedChannel::noteWait() {
  const std::string sentence = _source->waitNote();
  if (!sentence.empty() || _report.note == _waitNote) note(sentence);
  _waitNote = sentence;
}

void ServedChannel::sendLater(std::chrono::milliseconds delay) {
  if (!_next) return;
  _host.queue.after(delay, [weak = weak_from_this(), turn = ++_turn] {
    const auto channel = weak.lock();
    if (channel && channel->_turn == turn) channel->sendWhatIsDue();
  });
}

void ServedChannel::pause() {
  if (!_pausedAt) _pausedAt = _host.uptime();
}

void ServedChannel::goOn() {
  if (!_pausedAt) return;
  _startedAt += _host.uptime() - *std::exchange(_pausedAt, std::nullopt);
  _withoutRoomSince.reset();
  sendLater(0ms);
}

void ServedChannel::setSpeed(double speed) {
  _speed = speed;
  if (!_source) return;
  const auto due = _source->setSpeed(speed, streamTime());
  if (_next) _next->at = due;
  sendLater(0ms);
}

void ServedChannel::seek(const StreamPlace& place) {
  if (!_source) return;
  const auto now = streamTime();
  const auto seeking = _source->seek(place, now);
  if (_report.note == std::exchange(_endNote, {})) note("");
  if (seeking == MessageSource::Seeking::StartsOver) {
    // A message that has waited for room until now is no longer due: it comes again in its turn.
    if (_next && _isReceived) --_counts.received;
    takeNext();
  } else if (_next) {
    _next->at = now;
  }
  sendLater(0ms);
}

std::optional<StreamPosition> ServedChannel::position() const {
  return _source ? _source->position() : std::nullopt;
}

MessageCounts ServedChannel::counts() const {
  MessageCounts counts = _counts;
  if (!_ended) return counts;
  if (_next && _isReceived) ++counts.waiting;
  if (!_source) return counts;
  counts.received += _source->waiting();
  counts.waiting += _source->waiting();
  return counts;
}

ServedChannel::Delivery ServedChannel::deliver(ByteView message) {
  if (!_filter.takes(message)) {
    ++_counts.notAskedFor;
    return Delivery::Done;
  }
  if (message.size() > maximumPayload) return refuseLength(message.size());
  const std::int32_t status = _viewer->sendRequest(0, message, 0ms, std::nullopt).status;
  if (status == RemotePort::sendTimeout) return waitForRoom();
  if (status != 0) {
    logLine(logNoticePriority, "The viewer has gone away (status %d)", status);
    return Delivery::Ended;
  }
  _withoutRoomSince.reset();
  ++_counts.delivered;
  _host.messageSent(message);
  return makeFault();
}

ServedChannel::Delivery ServedChannel::makeFault() {
  const Fault& fault = _host.fault;
  if (fault.isDue(Fault::Kind::Garbage, _counts.delivered)) {
    static_cast<void>(_viewer->sendRequest(0, garbage(), 0ms, std::nullopt));
  } else if (fault.isDue(Fault::Kind::DropChannel, _counts.delivered)) {
    // The message in hand was delivered.
    _next.reset();
    return Delivery::Ended;
  }
  return Delivery::Done;
}

ServedChannel::Delivery ServedChannel::waitForRoom() {
  const auto now = _host.uptime();
  if (!_withoutRoomSince) _withoutRoomSince = now;
  if (now - *_withoutRoomSince >= patience) {
    logError("A viewer that does not read is dropped");
    return Delivery::Ended;
  }
  if (_source->isSeeking()) return Delivery::NoRoom;
  const bool isLate = now - (_startedAt + _next->at) > longestDelay;
  if (!isLate || _source->lateness() != MessageSource::Lateness::IsDropped) return Delivery::NoRoom;
  ++_counts.dropped;
  return Delivery::Done;
}

// The transport would take a message that is too long for a broken connection.
ServedChannel::Delivery ServedChannel::refuseLength(std::size_t length) {
  if (++_counts.tooLong <= mostNamedAsTooLong)
    logError("%s is left out: it has %ld bytes, and the channel takes %ld", _source->nameOfLast(), length,
             maximumPayload);
  return Delivery::Done;
}

void ServedChannel::countLost(std::uint64_t messages) {
  _counts.received += messages;
  _counts.dropped += messages;
}

void ServedChannel::end() {
  if (_source && _ended) countLost(_source->takeLost() + _source->waiting());
  if (_next && _isReceived) {
    // What is handed on is counted with the viewer that gets it.
    if (_source->lateness() == MessageSource::Lateness::IsHandedOn) {
      --_counts.received;
    } else {
      ++_counts.dropped;
    }
  }
  _next.reset();
  // This must be last: it may release this channel.
  if (const auto ended = std::exchange(_ended, nullptr)) ended();
}

}  // namespace varnel
