#include "programs/varnel-telephonyd/PipedReplay.h"

#include <utility>

#include "base/Log.h"

namespace varnel {

class PipedReplay::Source final : public MessageSource {
 public:
  explicit Source(PipedReplay& replay) : startedAt(replay._setup.uptime()), _replay(replay) {
    _replay.enter(*this);
  }
  Source(const Source&) = delete;
  Source& operator=(const Source&) = delete;
  ~Source() override { _replay.leave(*this); }

  std::optional<StreamMessage> next() override { return _replay.nextOf(*this); }
  bool isWaiting() const override { return _replay._endNote.empty() || _replay._held; }
  void setNewsHandler(std::function<void()> handler) override { _handler = std::move(handler); }
  std::string waitNote() const override {
    if (_replay.hasStream(*this) || !isWaiting()) return {};
    return "another viewer shows " + _replay._setup.name +
           ", which can be read only once; this one goes on when that one ends";
  }
  std::string nameOfLast() const override {
    return "Record " + std::to_string(_replay._recordsRead) + " of " + _replay._setup.name;
  }
  Lateness lateness() const override { return Lateness::IsHandedOn; }
  std::string endNote() const override { return _replay._endNote; }
  bool isEndTold() const override { return _replay._isEndTold; }

  void callHandler() const {
    if (_handler) _handler();
  }

  const std::chrono::milliseconds startedAt;
  bool hasTaken = false;  // whether it has the held record

 private:
  PipedReplay& _replay;
  std::function<void()> _handler;
};

PipedReplay::PipedReplay(Setup setup)
    : _setup(std::move(setup)),
      _subscription(_setup.name, _setup.subscription, _setup.unasked),
      _pace(_setup.name, _setup.speed) {}

std::unique_ptr<MessageSource> PipedReplay::makeSource() { return std::make_unique<Source>(*this); }

void PipedReplay::enter(Source& source) {
  _sources.push_back(&source);
  if (!_pausedAt) return;
  const auto pause = _setup.uptime() - *std::exchange(_pausedAt, std::nullopt);
  _pace.delay(pause);
  if (_held) _held->due += pause;
}

// The pace of a live stream does not pause: what has come meanwhile is late.
void PipedReplay::leave(Source& source) {
  const bool hadStream = hasStream(source);
  _sources.remove(&source);
  if (!hadStream) return;
  if (!_sources.empty()) return wakeFirst();
  if (_held && _held->wasEarly) _pausedAt = _setup.uptime();
}

std::optional<StreamMessage> PipedReplay::nextOf(Source& source) {
  if (!hasStream(source)) return std::nullopt;
  if (std::exchange(source.hasTaken, false)) _held.reset();
  if (_held) {
    source.hasTaken = true;
    return StreamMessage{_held->due - source.startedAt, _held->message};
  }
  if (!_endNote.empty()) {
    _isEndTold = true;
  } else if (!std::exchange(_isRequested, true)) {
    _setup.reader->request();
  }
  return std::nullopt;
}

void PipedReplay::recordArrived() {
  auto reading = _setup.reader->take();
  if (!reading) return;
  _isRequested = false;
  for (const std::string& line : reading->lines) logError("%s", line);
  if (reading->isEnd) {
    end(reading->error);
  } else {
    ++_recordsRead;
    if (_subscription.takes(reading->subscription)) hold(std::move(*reading));
  }
  for (const Source* source : _sources) source->callHandler();
}

void PipedReplay::hold(RecordReading reading) {
  const auto now = _setup.uptime();
  const bool isDueNow = reading.wasAwaited || !_pace.hasBegun();
  const auto due = isDueNow ? _pace.arriving(reading.time, now) : _pace.following(reading.time);
  _held = HeldRecord{.due = due, .message = std::move(reading.message), .wasEarly = due > now};
}

void PipedReplay::end(const std::string& error) {
  if (error.empty()) {
    _endNote = _subscription.endNote(_pace.hasBegun());
    return;
  }
  logError("The replay ends: %s", error);
  _endNote = "the replay has ended early: " + error;
}

// Deferred: a channel is being released now.
void PipedReplay::wakeFirst() {
  _setup.queue.async([this, life = std::weak_ptr(_life)] {
    if (!life.expired() && !_sources.empty()) _sources.front()->callHandler();
  });
}

}  // namespace varnel
