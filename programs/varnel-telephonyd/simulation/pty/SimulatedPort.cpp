#include "programs/varnel-telephonyd/simulation/pty/SimulatedPort.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "base/MessagePrefix.h"
#include "host/captures/FrameEncoding.h"
#include "host/captures/LittleEndian.h"

namespace varnel {

namespace {

namespace layout = logConfiguration;

constexpr std::uint8_t unknownCommand = 0x13, badParameter = 0x14, badLength = 0x15;
constexpr std::uint32_t good = 0, bad = 1;
constexpr std::size_t versionSize = 55;
constexpr std::string_view versionTexts = "Nov 22 202612:00:00Nov 22 202612:00:00simulate";
constexpr std::size_t codeOffset = 3;  // in a packet, which begins with its log type

// Of each equipment that a simulated modem has log codes of: CDMA2000, UMTS, GSM, their signaling, LTE and
// NR, TD-SCDMA.
constexpr CodeNumbers numbers = [] {
  CodeNumbers result{};
  for (const std::size_t equipment : {0x1, 0x4, 0x5, 0x7, 0xB, 0xD}) result[equipment] = codesOfEquipment;
  return result;
}();

Bytes refusalOf(ByteView request, std::uint8_t error) {
  Bytes contents{error};
  contents.insert(contents.end(), request.begin(), request.end());
  return contents;
}

Bytes versionAnswer() {
  Bytes contents(versionSize);
  contents[0] = portCommand::version;
  std::ranges::copy(versionTexts, contents.begin() + 1);
  return contents;
}

Bytes buildAnswer(std::string_view build) {
  Bytes contents{portCommand::build, 1, 0, 0};
  appendLittleEndian(contents, std::uint32_t{0});  // model
  appendLittleEndian(contents, std::uint32_t{0});  // version
  contents.insert(contents.end(), build.begin(), build.end());
  contents.push_back(0);
  return contents;
}

Bytes configurationAnswer(std::uint32_t operation, std::uint32_t status) {
  Bytes contents{portCommand::logConfiguration, 0, 0, 0};
  appendLittleEndian(contents, operation);
  appendLittleEndian(contents, status);
  return contents;
}

// The log code of a packet, which may have a prefix. Nothing for what is shorter.
std::optional<std::uint16_t> codeOf(ByteView message) {
  if (message.size() > prefixSize && message[0] == prefixMark) message = message.subspan(prefixSize);
  if (message.size() < codeOffset + 2) return std::nullopt;
  return loadLittleEndian<std::uint16_t>(message, codeOffset);
}

Time later(Time time, std::chrono::milliseconds duration) {
  constexpr std::int64_t perSecond = 1'000'000'000;
  const std::int64_t sum =
      time.nanoseconds + std::chrono::duration_cast<std::chrono::nanoseconds>(duration).count();
  return {time.seconds + sum / perSecond, static_cast<std::int32_t>(sum % perSecond)};
}

}  // namespace

SimulatedPort::SimulatedPort(Setup setup) : _setup(std::move(setup)), _next(_setup.modem->next()) {}

void SimulatedPort::take(ByteView bytes) {
  _requests.take(bytes, [this](std::span<std::uint8_t> contents) { answer(contents); });
}

void SimulatedPort::answer(ByteView request) {
  Bytes frame;
  appendFramed(frame, answerTo(request));
  _setup.send(frame);
  switchPhone();
}

Bytes SimulatedPort::answerTo(ByteView request) {
  switch (request[0]) {
    case portCommand::version:
      return versionAnswer();
    case portCommand::build:
      return buildAnswer(_setup.build);
    case portCommand::events:
      if (request.size() != portRequest::eventsOff().size()) return refusalOf(request, badLength);
      return {request.begin(), request.end()};
    case portCommand::debugText:
      if (!std::ranges::equal(request, portRequest::debugTextOff())) return refusalOf(request, badParameter);
      return {portCommand::debugText, request[1], 1, 0, 0, 0, 0, 0};
    case portCommand::logConfiguration:
      return configure(request);
    default:
      return refusalOf(request, unknownCommand);
  }
}

Bytes SimulatedPort::configure(ByteView request) {
  if (request.size() < layout::equipmentOffset) return refusalOf(request, badLength);
  const auto operation = loadLittleEndian<std::uint32_t>(request, layout::operationOffset);
  if (operation == layout::setCodes) return setCodes(request);
  if (operation == layout::allOff) {
    _masks = {};
    return configurationAnswer(operation, good);
  }
  if (operation != layout::numbers) return refusalOf(request, badParameter);
  Bytes contents = configurationAnswer(operation, good);
  for (const std::uint32_t number : numbers) appendLittleEndian(contents, number);
  return contents;
}

// Repeats the request behind the status.
Bytes SimulatedPort::setCodes(ByteView request) {
  if (request.size() < layout::maskOffset) return refusalOf(request, badLength);
  const auto equipment = loadLittleEndian<std::uint32_t>(request, layout::equipmentOffset);
  const auto count = loadLittleEndian<std::uint32_t>(request, layout::countOffset);
  const ByteView mask = request.subspan(layout::maskOffset);
  const bool isGood = equipment < equipments && count <= numbers[equipment] && mask.size() == (count + 7) / 8;
  if (isGood) _masks[equipment] = Bytes(mask.begin(), mask.end());
  Bytes contents = configurationAnswer(layout::setCodes, isGood ? good : bad);
  const ByteView rest = request.subspan(layout::equipmentOffset);
  contents.insert(contents.end(), rest.begin(), rest.end());
  return contents;
}

bool SimulatedPort::isOn(std::uint32_t code) const {
  const Bytes& mask = _masks[code / codesOfEquipment];
  const std::uint32_t bit = code % codesOfEquipment;
  return bit / 8 < mask.size() && (mask[bit / 8] >> bit % 8 & 1) != 0;
}

// The phone walks while a log code is on.
void SimulatedPort::switchPhone() {
  const bool isAnyOn = std::ranges::any_of(_masks, [](const Bytes& mask) {
    return std::ranges::any_of(mask, [](std::uint8_t bits) { return bits != 0; });
  });
  if (isAnyOn == std::exchange(_isWalking, isAnyOn)) return;
  ++_walks;
  if (!isAnyOn) {
    _phoneTime += _setup.uptime() - _walksSince;
    return;
  }
  _walksSince = _setup.uptime();
  _walkedOffAt = _setup.now();
  playLater();
}

void SimulatedPort::playLater() {
  const Milliseconds phoneTime = _phoneTime + _setup.uptime() - _walksSince;
  _setup.queue.after(std::max(_next.at - phoneTime, Milliseconds(0)),
                     [this, walk = _walks, life = std::weak_ptr(_life)] {
                       if (!life.expired() && walk == _walks) play();
                     });
}

void SimulatedPort::play() {
  const Milliseconds phoneTime = _phoneTime + _setup.uptime() - _walksSince;
  for (; _next.at <= phoneTime; _next = _setup.modem->next()) sendRecord(_next);
  playLater();
}

void SimulatedPort::sendRecord(const SimulatedMessage& message) {
  const auto code = codeOf(message.bytes);
  if (!code || !isOn(*code)) return;
  const Milliseconds sinceWalkedOff = std::max(message.at - _phoneTime, Milliseconds(0));
  const ByteView frame = _writer.encode({.time = later(_walkedOffAt, sinceWalkedOff),
                                         .message = message.bytes,
                                         .subscription = subscriptionOf(message.bytes)});
  if (frame.empty()) return;  // it is a message of a telephony server, which no modem sends
  ++(_setup.send(frame) ? _sent : _dropped);
}

}  // namespace varnel
