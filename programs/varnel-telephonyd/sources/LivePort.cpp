#include "programs/varnel-telephonyd/sources/LivePort.h"

#include <stdexcept>
#include <utility>

#include "programs/varnel-telephonyd/sources/PortSource.h"
#include "programs/varnel-telephonyd/sources/PortTrouble.h"

namespace varnel {

namespace {

constexpr std::chrono::milliseconds reconnectInterval = std::chrono::seconds(1);

}  // namespace

LivePort::LivePort(Setup setup) : _setup(std::move(setup)) {}

void LivePort::open() {
  if (const auto trouble = connect()) throw std::runtime_error(*trouble);
}

std::unique_ptr<MessageSource> LivePort::makeSource() { return std::make_unique<PortSource>(*this); }

void LivePort::end(std::function<void()> ended) {
  _isEnding = true;
  _ended = std::move(ended);
  if (!_session) return finish();
  _session->end([this] { finish(); });
}

void LivePort::finish() {
  _setup.device->close();
  if (const auto ended = std::exchange(_ended, nullptr)) ended();
}

void LivePort::enter(PortSource& source) { _sources.push_back(&source); }

void LivePort::leave(PortSource& source) {
  _sources.remove(&source);
  updateCodesLater();
}

void LivePort::updateCodes() {
  if (!_session || _isEnding) return;
  WantedCodes wanted;
  for (const PortSource* source : _sources)
    if (source->filter()) wanted.add(*source->filter());
  if (_session->isReady()) setNote("");  // other codes may not be refused
  _session->setWanted(std::move(wanted));
  tellMissingCodes();
}

// Deferred: when a viewer only starts over, its next channel comes at once.
void LivePort::updateCodesLater() {
  _setup.queue.async([this, life = std::weak_ptr(_life)] {
    if (!life.expired()) updateCodes();
  });
}

std::optional<std::string> LivePort::connect() {
  auto trouble = _setup.device->open(
      {.bytesCame = [this](ByteView bytes) { takeBytes(bytes); }, .wentAway = [this] { beUnplugged(); }});
  if (trouble) return trouble;
  _reads.begin(_setup.device->isSerialLine() ? DeviceReads::Device::SerialLine : DeviceReads::Device::Other);
  _session = std::make_unique<PortSession>(PortSession::Setup{
      .queue = _setup.queue,
      .send = [this](ByteView bytes) { _setup.device->send(bytes); },
      .record = [this](const CaptureRecord& record) { takeRecord(record); },
      .ready = [this] { becomeReady(); },
      .failed = [this](const PortFailure& failure) { fail(failure); },
      .refused = [this](std::size_t equipment, const std::string& detail) { beRefused(equipment, detail); },
      .leftOut = _leftOut});
  _session->begin();
  return std::nullopt;
}

void LivePort::disconnect() {
  _setup.device->close();
  if (_session) _session->takeEnd();
  _session.reset();
}

void LivePort::reconnectLater() {
  _setup.queue.after(reconnectInterval, [this, life = std::weak_ptr(_life)] {
    if (!life.expired()) reconnect();
  });
}

// A trouble that lasts is told. One that a single attempt meets is not: a device that has just come back
// belongs to root for a moment.
void LivePort::reconnect() {
  if (_session || _isEnding) return;
  const auto trouble = connect();
  if (!trouble) return;
  const bool isMissing = *trouble == troubleOfMissing(_setup.name);
  if (!isMissing && *trouble == _lastTrouble) setNote(*trouble);
  _lastTrouble = *trouble;
  reconnectLater();
}

void LivePort::becomeReady() {
  const bool isBack = std::exchange(_hasBeenReady, true);
  _lastTrouble.clear();
  setNote("");
  if (isBack) {
    _setup.tell(_setup.name + " is back");
  } else {
    _setup.ready(_session->build());
  }
  updateCodes();
}

void LivePort::takeBytes(ByteView bytes) {
  if (!_session) return;
  _reads.take(bytes, [this](ByteView stream) { _session->take(stream); });
  for (const PortSource* source : _sources)
    if (source->waiting() > 0) source->callHandler();
}

void LivePort::takeRecord(const CaptureRecord& record) {
  ++_records;
  const auto now = _setup.uptime();
  for (PortSource* source : _sources) source->push(now, record.message);
}

void LivePort::beUnplugged() {
  disconnect();
  const std::string sentence = troubleOfUnplugged(_setup.name);
  if (_isEnding) return finish();
  if (!_hasBeenReady) return _setup.failed(sentence);
  setNote(sentence);
  reconnectLater();
}

void LivePort::beRefused(std::size_t equipment, const std::string& detail) {
  const std::string sentence = troubleOfRefusedCodes(_setup.name, equipment, detail);
  _setup.tell(sentence);
  if (_session->refusesAll()) setNote(troubleOf({PortFailure::Kind::Refuses, detail}, _setup.name));
}

// Deferred: the session is in the middle of its work.
void LivePort::fail(const PortFailure& failure) {
  _setup.queue.async([this, failure, life = std::weak_ptr(_life)] {
    if (life.expired() || !_session || _isEnding) return;
    disconnect();
    const std::string sentence = troubleOf(failure, _setup.name);
    if (!_hasBeenReady) return _setup.failed(sentence);
    setNote(sentence);
    reconnectLater();
  });
}

void LivePort::tellMissingCodes() {
  const std::size_t missing = _session->missingCodes();
  if (std::exchange(_toldMissing, missing) == missing || missing == 0) return;
  _setup.tell("the modem of " + _setup.name + " does not have " + std::to_string(missing) +
              " of the log codes that viewers ask for; they are left out");
}

void LivePort::setNote(const std::string& note) {
  if (note == _note) return;
  _note = note;
  if (!note.empty()) _setup.tell(note);
  wakeSources();
}

void LivePort::wakeSources() {
  for (const PortSource* source : _sources) source->callHandler();
}

std::string inWords(std::uint64_t records, const LeftOut& leftOut) {
  constexpr struct {
    std::uint64_t LeftOut::*count;
    const char* name;
  } kinds[] = {
      {&LeftOut::badChecksum, "with a wrong checksum"},
      {&LeftOut::torn, "torn"},
      {&LeftOut::otherCommands, "of other commands"},
      {&LeftOut::encrypted, "encrypted"},
      {&LeftOut::broken, "broken"},
      {&LeftOut::tooLong, "too long"},
  };
  std::string words = "port: " + std::to_string(records) + " records, " + std::to_string(leftOut.frames()) +
                      " frames left out";
  std::string separator = " (";
  for (const auto& kind : kinds) {
    if (leftOut.*kind.count == 0) continue;
    words += std::exchange(separator, ", ") + std::to_string(leftOut.*kind.count) + ' ' + kind.name;
  }
  if (leftOut.frames() > 0) words += ')';
  return leftOut.noiseBytes > 0 ? words + ", " + std::to_string(leftOut.noiseBytes) + " bytes in no frame"
                                : words;
}

}  // namespace varnel
