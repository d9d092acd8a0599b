#include "programs/varnel-telephonyd/sources/PortSession.h"

#include <algorithm>
#include <memory>
#include <string_view>
#include <utility>

#include "host/captures/FrameEncoding.h"
#include "host/captures/LogFrame.h"

namespace varnel {

namespace {

using namespace std::chrono_literals;

constexpr std::chrono::milliseconds answerTime = 2s;
// An answer may be lost, and the first request may follow the half of one that another program has sent.
constexpr int mostAttempts = 2;
constexpr std::size_t mostHeard = 1024;
// A port for AT commands may repeat what it gets, some without the byte 0 at its beginning.
constexpr std::string_view repeatedVersion = "x\xF0~";
// What such a port replies, or says of its own accord.
constexpr std::string_view textReplies[] = {"\r\nOK\r", "\r\nERROR\r", "\r\nRING\r"};

bool isLog(ByteView contents) {
  return !contents.empty() &&
         (contents[0] == frameCommand::log || contents[0] == frameCommand::ofSubscription ||
          contents[0] == frameCommand::encryptedLog);
}

bool contains(ByteView bytes, std::string_view part) {
  const auto isSame = [](std::uint8_t byte, char letter) { return static_cast<char>(byte) == letter; };
  return std::search(bytes.begin(), bytes.end(), part.begin(), part.end(), isSame) != bytes.end();
}

// A line that begins with + or ^ and a letter, such as "+CREG: 1".
bool hasReport(ByteView bytes) {
  for (std::size_t i = 3; i < bytes.size(); ++i) {
    const bool isLetter = bytes[i] >= 'A' && bytes[i] <= 'Z';
    const bool isMarked = bytes[i - 1] == '+' || bytes[i - 1] == '^';
    if (isLetter && isMarked && bytes[i - 2] == '\n' && bytes[i - 3] == '\r') return true;
  }
  return false;
}

}  // namespace

PortSession::PortSession(Setup setup) : _setup(std::move(setup)), _frameStream(_setup.leftOut) {}

void PortSession::begin() {
  plan(Step::Version);
  goOn();
}

void PortSession::take(ByteView bytes) {
  if (_frames == 0) listenForText(bytes);
  _frameStream.take(bytes, [this](std::span<std::uint8_t> contents) { takeFrame(contents); });
}

void PortSession::setWanted(WantedCodes wanted) {
  if (wanted == _wanted) return;
  _wanted = std::move(wanted);
  _refusedMasks = {};
  if (_numbers) _masks = _wanted.masksFor(*_numbers);
  goOn();
}

// An answer that is on its way is not waited for. What is no diagnostic port gets no more requests.
void PortSession::end(std::function<void()> ended) {
  _ended = std::move(ended);
  _requests.clear();
  _isWaiting = false;
  if (_isOver || _frames == 0) return finish();
  planQuiet();
  goOn();
}

bool PortSession::refusesAll() const {
  bool hasRefused = false;
  for (std::size_t equipment = 0; equipment < equipments; ++equipment) {
    if (_masks[equipment].count == 0) continue;
    if (_refusedMasks[equipment] != _masks[equipment]) return false;
    hasRefused = true;
  }
  return hasRefused;
}

void PortSession::plan(Step step) {
  const auto contents = [&]() -> Bytes {
    switch (step) {
      case Step::Version:
        return portRequest::version();
      case Step::Build:
        return portRequest::build();
      case Step::EventsOff:
        return portRequest::eventsOff();
      case Step::DebugTextOff:
        return portRequest::debugTextOff();
      case Step::AllCodesOff:
        return portRequest::allCodesOff();
      case Step::CodeNumbers:
        return portRequest::codeNumbers();
      case Step::SetCodes:
        return setCodesRequest();
    }
    return {};
  };
  _requests.push_back({.step = step, .contents = contents()});
}

void PortSession::planBeginning() {
  for (const Step step :
       {Step::Build, Step::EventsOff, Step::DebugTextOff, Step::AllCodesOff, Step::CodeNumbers})
    plan(step);
}

void PortSession::planQuiet() {
  plan(Step::EventsOff);
  plan(Step::AllCodesOff);
  plan(Step::DebugTextOff);
}

// Plans the next thing that is not yet as it shall be.
void PortSession::planCodes() {
  if (_wanted.isEmpty()) {
    if (!_isQuiet) planQuiet();
    return;
  }
  for (std::size_t equipment = 0; equipment < equipments; ++equipment) {
    const CodeMask& mask = _masks[equipment];
    if (mask == _set[equipment] || mask == _refusedMasks[equipment]) continue;
    _equipment = equipment;
    _mask = mask;
    return plan(Step::SetCodes);
  }
}

// A mask without codes is as long as the one that it replaces.
Bytes PortSession::setCodesRequest() const {
  if (_mask.count > 0) return portRequest::setCodes(_equipment, _mask);
  const CodeMask& present = _set[_equipment];
  return portRequest::setCodes(_equipment, {.count = present.count, .bits = Bytes(present.bits.size())});
}

void PortSession::goOn() {
  if (_isWaiting || _isOver) return;
  if (_requests.empty() && _ended) return finish();
  if (_requests.empty() && _numbers) planCodes();
  if (!_requests.empty()) transmit();
}

void PortSession::transmit() {
  _isWaiting = true;
  if (_requests.front().step == Step::SetCodes) _isQuiet = false;
  _setup.queue.after(answerTime, [this, number = ++_sent, life = std::weak_ptr(_life)] {
    if (!life.expired()) timeIsUp(number);
  });
  send(_requests.front());
}

void PortSession::send(const Request& request) const {
  Bytes frame;
  appendFramed(frame, request.contents);
  _setup.send(frame);
}

void PortSession::timeIsUp(std::uint64_t number) {
  if (number != _sent || !_isWaiting || _isOver) return;
  _isWaiting = false;
  Request request = std::move(_requests.front());
  _requests.pop_front();
  unanswered(std::move(request));
  goOn();
}

void PortSession::takeFrame(std::span<std::uint8_t> contents) {
  const bool isEcho = !contents.empty() && std::ranges::equal(contents, portRequest::version());
  if (!isEcho) ++_frames;
  if (isLog(contents)) {
    CaptureRecord record;
    if (takeLogFrame(contents, record, _setup.leftOut)) _setup.record(record);
    return;
  }
  if (!_isWaiting || !isAnswer(contents, _requests.front().contents)) {
    ++_setup.leftOut.otherCommands;
    return;
  }
  _isWaiting = false;
  const Request request = std::move(_requests.front());
  _requests.pop_front();
  answered(request.step, contents);
  goOn();
}

void PortSession::listenForText(ByteView bytes) {
  _heard.insert(_heard.end(), bytes.begin(), bytes.end());
  if (_heard.size() > mostHeard)
    _heard.erase(_heard.begin(), _heard.end() - static_cast<std::ptrdiff_t>(mostHeard));
}

bool PortSession::hasHeardText() const {
  return contains(_heard, repeatedVersion) || hasReport(_heard) ||
         std::ranges::any_of(textReplies, [&](std::string_view reply) { return contains(_heard, reply); });
}

void PortSession::answered(Step step, ByteView answer) {
  const auto detail = refusal(answer);
  switch (step) {
    case Step::Version:
      if (!detail) _build = compilationIn(answer);
      return planBeginning();
    case Step::Build:
      if (const std::string build = buildIn(answer); !detail && !build.empty()) _build = build;
      return;
    case Step::AllCodesOff:
      if (detail && !_numbers) return fail({PortFailure::Kind::Refuses, *detail});
      _set = {};
      _isQuiet = true;
      return;
    case Step::CodeNumbers:
      return takeNumbers(answer, detail);
    case Step::SetCodes:
      return codesSet(detail);
    case Step::EventsOff:
    case Step::DebugTextOff:
      return;
  }
}

void PortSession::unanswered(Request request) {
  if (_ended && request.step == Step::AllCodesOff) {
    for (const Request& rest : _requests) send(rest);
    return finish();
  }
  switch (request.step) {
    case Step::Version:
      if (_frames == 0 && hasHeardText()) return fail({PortFailure::Kind::AnswersText});
      if (request.attempt < mostAttempts) return repeat(std::move(request));
      // A port that sends frames is one, even when its answer was lost twice among them.
      if (_frames > 0) return planBeginning();
      return fail({PortFailure::Kind::AnswersNothing});
    case Step::AllCodesOff:
    case Step::CodeNumbers:
    case Step::SetCodes:
      if (request.attempt < mostAttempts) return repeat(std::move(request));
      if (_numbers) return fail({PortFailure::Kind::FallsSilent});
      return fail({PortFailure::Kind::Refuses, "no answer"});
    case Step::Build:
    case Step::EventsOff:
    case Step::DebugTextOff:
      return;
  }
}

void PortSession::repeat(Request request) {
  ++request.attempt;
  _requests.push_front(std::move(request));
}

void PortSession::takeNumbers(ByteView answer, const std::optional<std::string>& detail) {
  if (detail) return fail({PortFailure::Kind::Refuses, *detail});
  _numbers = codeNumbersIn(answer);
  if (!_numbers)
    return fail({PortFailure::Kind::Refuses, "an answer of " + std::to_string(answer.size()) + " bytes"});
  _masks = _wanted.masksFor(*_numbers);
  _setup.ready();
}

void PortSession::codesSet(const std::optional<std::string>& detail) {
  if (!detail) {
    _set[_equipment] = _mask;
    return;
  }
  _refusedMasks[_equipment] = _mask;
  _setup.refused(_equipment, *detail);
}

void PortSession::fail(const PortFailure& failure) {
  _requests.clear();
  _isOver = true;
  _setup.failed(failure);
}

void PortSession::finish() {
  _requests.clear();
  _isWaiting = false;
  _isOver = true;
  if (const auto ended = std::exchange(_ended, nullptr)) ended();
}

}  // namespace varnel
