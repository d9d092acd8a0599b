#include "programs/varnel-telephonyd/TelephonyServer.h"

#include <algorithm>
#include <cstdlib>
#include <string>
#include <utility>

#include "base/Log.h"
#include "host/TelephonyProtocol.h"

namespace varnel {

namespace {

namespace protocol = telephonyProtocol;

// Begins with the name of the service's socket, like every port of the service.
constexpr std::string_view commandPortPrefix = "com.orvane.TelephonyServer.LogChannel.";
constexpr std::chrono::milliseconds viewerCheckInterval = std::chrono::seconds(1);
constexpr std::chrono::milliseconds lossesInterval = std::chrono::seconds(10);
constexpr std::size_t mostChannels = 16;

}  // namespace

TelephonyServer::TelephonyServer(ChannelHost host)
    : _host(std::move(host)),
      _messageSent(std::exchange(_host.messageSent, [this](ByteView message) { countSent(message); })),
      _viewerCheck(_host.queue.repeating(viewerCheckInterval, [this] { checkViewers(); })) {}

// A crash is one of the program, so the messages of all channels count.
void TelephonyServer::countSent(ByteView message) {
  _messageSent(message);
  if (_host.fault.isDue(Fault::Kind::Crash, ++_sent)) std::abort();
}

TelephonyConnection::LogChannel TelephonyServer::createLogChannel(std::string_view viewerPortName) {
  if (viewerPortName.starts_with(protocol::socketName)) {
    logWarning("A log channel was asked for \"%s\", a port of the server's own", viewerPortName);
    return {protocol::portOfTheService, std::nullopt};
  }
  if (_host.fault.is(Fault::Kind::RefuseChannel)) return {protocol::tooManyChannels, std::nullopt};
  if (_channels.size() >= mostChannels) {
    logWarning("A log channel was asked for, and %ld are open", _channels.size());
    return {protocol::tooManyChannels, std::nullopt};
  }
  auto viewer = _host.ports.createRemotePort(viewerPortName);
  if (!viewer) {
    logWarning("A log channel was asked for port \"%s\", which does not answer", viewerPortName);
    return {protocol::viewerPortMissing, std::nullopt};
  }
  const unsigned number = freeNumber();
  const std::string portName = std::string(commandPortPrefix) + std::to_string(number);
  const auto channel = std::make_shared<ServedChannel>(_host, std::move(viewer), std::string(viewerPortName));
  if (!channel->open(portName, [this, number] { close(number); })) {
    logError("The port \"%s\" could not be made", portName);
    return {protocol::commandPortNotMade, std::nullopt};
  }
  channel->note(_note);
  if (_isPaused) channel->pause();
  if (_speed) channel->setSpeed(*_speed);
  _channels.emplace(number, channel);
  logLine(logNoticePriority, "A log channel to port \"%s\" is open", viewerPortName);
  if (_host.fault.is(Fault::Kind::NoPort)) return {0, std::nullopt};
  if (_host.fault.is(Fault::Kind::WrongPort)) return {0, std::string(commandPortPrefix) + "0"};
  return {0, portName};
}

unsigned TelephonyServer::freeNumber() const {
  unsigned number = 1;
  while (_channels.contains(number)) ++number;
  return number;
}

void TelephonyServer::close(unsigned number) {
  const auto ended = _channels.extract(number);
  const MessageCounts counts = ended.mapped()->counts();
  _endedCounts += counts;
  logLine(logNoticePriority, "A log channel is closed: %s", inWords(counts));
}

void TelephonyServer::end() {
  const auto channels = _channels;
  for (const auto& [number, channel] : channels) channel->end();
}

void TelephonyServer::note(const std::string& sentence) {
  _note = sentence;
  for (const auto& [number, channel] : _channels) channel->note(sentence);
}

void TelephonyServer::pause() {
  _isPaused = true;
  for (const auto& [number, channel] : _channels) channel->pause();
}

void TelephonyServer::goOn() {
  _isPaused = false;
  for (const auto& [number, channel] : _channels) channel->goOn();
}

void TelephonyServer::setSpeed(double speed) {
  _speed = speed;
  for (const auto& [number, channel] : _channels) channel->setSpeed(speed);
}

void TelephonyServer::seek(const StreamPlace& place) {
  for (const auto& [number, channel] : _channels) channel->seek(place);
}

void TelephonyServer::changeTechnology(const std::string& technology) {
  _host.technology = technology;
  end();
}

std::optional<StreamPosition> TelephonyServer::position() const {
  for (const auto& [number, channel] : _channels)
    if (const auto position = channel->position()) return position;
  return std::nullopt;
}

bool TelephonyServer::isSeeking() const {
  return std::ranges::any_of(_channels, [](const auto& numbered) { return numbered.second->isSeeking(); });
}

std::set<std::string, std::less<>> TelephonyServer::viewerPorts() const {
  std::set<std::string, std::less<>> names;
  for (const auto& [number, channel] : _channels) names.insert(channel->viewerPortName());
  return names;
}

MessageCounts TelephonyServer::counts() const {
  MessageCounts counts = _endedCounts;
  for (const auto& [number, channel] : _channels) counts += channel->counts();
  return counts;
}

void TelephonyServer::checkViewers() {
  const auto channels = _channels;  // a copy: a check may end its channel
  for (const auto& [number, channel] : channels) channel->checkViewer();
  tellLosses();
}

void TelephonyServer::tellLosses() {
  const MessageCounts all = counts();
  const std::uint64_t losses = all.dropped + all.tooLong;
  const auto now = _host.uptime();
  if (losses == _toldLosses || (_toldLosses > 0 && now - _lossesToldAt < lossesInterval)) return;
  _toldLosses = losses;
  _lossesToldAt = now;
  _host.tell(inWords(all));
}

}  // namespace varnel
