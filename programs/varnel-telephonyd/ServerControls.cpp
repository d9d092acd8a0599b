#include "programs/varnel-telephonyd/ServerControls.h"

#include <algorithm>
#include <utility>

#include "programs/varnel-telephonyd/simulation/Technologies.h"

namespace varnel {

namespace {

using Command = ControlRequest::Command;

// How sentences call a source that comes as it comes.
std::string nameOfLive(ServedSource source) {
  switch (source) {
    case ServedSource::Port:
      return "a live port";
    case ServedSource::ModemManager:
      return "what ModemManager tells";
    case ServedSource::Simulation:
    case ServedSource::Capture:
    case ServedSource::StandardInput:
      break;
  }
  return "a replay of standard input";
}

bool isPlayable(ServedSource source) {
  return source == ServedSource::Simulation || source == ServedSource::Capture;
}

// A simulation has no end, so a seek in it needs one.
constexpr std::chrono::hours mostSimulated(24);

// Whether a simulation would play too long until the place. It begins at its start if the place was passed.
bool isTooFar(const StreamPlace& place, std::chrono::milliseconds position) {
  const auto* const sinceStart = std::get_if<std::chrono::milliseconds>(&place);
  if (!sinceStart) return false;
  return (*sinceStart > position ? *sinceStart - position : *sinceStart) > mostSimulated;
}

const char* wordOf(ServedSource source) {
  switch (source) {
    case ServedSource::Port:
      return "port";
    case ServedSource::ModemManager:
      return "ModemManager";
    case ServedSource::Simulation:
      return "simulation";
    case ServedSource::Capture:
      return "capture";
    case ServedSource::StandardInput:
      break;
  }
  return "standard input";
}

}  // namespace

ControlReply ServerControls::reply(const ControlRequest& request) {
  if (auto sentence = refusal(request)) return ControlRefusal{*std::move(sentence)};
  carryOut(request);
  return status();
}

std::optional<std::string> ServerControls::refusal(const ControlRequest& request) const {
  switch (request.command) {
    case Command::Pause:
    case Command::Continue:
    case Command::SetSpeed:
    case Command::Seek:
      return refusalOfPlaying(request);
    case Command::SetTechnology:
      return refusalOfTechnology(request.technology);
    case Command::Status:
    case Command::Stop:
      break;
  }
  return std::nullopt;
}

std::optional<std::string> ServerControls::refusalOfPlaying(const ControlRequest& request) const {
  const std::string live = nameOfLive(_setup.source);
  const bool isLive = !isPlayable(_setup.source);
  if (request.command == Command::SetSpeed) {
    if (isLive) return live + " comes at its own speed, which nothing can change";
    if (!varnel::isPlayable(request.speed)) return "the speed must lie between 0.001 and 1000000";
  } else if (request.command == Command::Seek) {
    if (isLive) return live + " has no places to go to: its messages come once";
    if (_setup.source == ServedSource::Simulation && std::holds_alternative<Time>(request.place))
      return "a simulation has no dates; name the time since its start, as in 1:30";
    const auto position = _setup.server.position();
    if (!position)
      return "there is no stream to seek in: no viewer is connected, and each one starts at the beginning";
    if (_setup.source == ServedSource::Simulation && isTooFar(request.place, position->sinceStart))
      return "a simulation plays at most 24 hours for a seek; name an earlier place";
  } else if (isLive) {
    return live + " cannot be paused: its messages come when they come";
  }
  return std::nullopt;
}

std::optional<std::string> ServerControls::refusalOfTechnology(const std::string& technology) const {
  if (!isPlayable(_setup.source))
    return nameOfLive(_setup.source) + " keeps its technology; start varnel-telephonyd again to change it";
  if (_setup.recording)
    return "the recording " + *_setup.recording +
           " is of one technology; start varnel-telephonyd again to change it";
  const auto known = simulatedTechnologies();
  if (std::ranges::find(known, technology) != std::ranges::end(known)) return std::nullopt;
  std::string names;
  for (const auto& name : known) names.append(names.empty() ? "" : ", ").append(name);
  return "there is no such technology; there are " + names;
}

void ServerControls::carryOut(const ControlRequest& request) {
  TelephonyServer& server = _setup.server;
  switch (request.command) {
    case Command::Pause:
      return server.pause();
    case Command::Continue:
      return server.goOn();
    case Command::SetSpeed:
      _speed = request.speed;
      return server.setSpeed(request.speed);
    case Command::Seek:
      return server.seek(request.place);
    case Command::SetTechnology:
      _setup.useTechnology(request.technology);
      return server.changeTechnology(request.technology);
    case Command::Stop:
      return _setup.stop();
    case Command::Status:
      break;
  }
}

ServerStatus ServerControls::status() const {
  const TelephonyServer& server = _setup.server;
  const MessageCounts counts = server.counts();
  ServerStatus status{.source = wordOf(_setup.source),
                      .name = _setup.name,
                      .technology = server.technology(),
                      .recording = _setup.recording.value_or(""),
                      .clients = _setup.clients(),
                      .channels = server.channels(),
                      .received = counts.received,
                      .delivered = counts.delivered,
                      .waiting = counts.waiting,
                      .dropped = counts.dropped,
                      .tooLong = counts.tooLong,
                      .notAskedFor = counts.notAskedFor,
                      .isPlayable = isPlayable(_setup.source),
                      .isPaused = server.isPaused(),
                      .isSeeking = server.isSeeking(),
                      .speed = _speed};
  if (_setup.modem) status.modem = _setup.modem();
  std::optional<LeftOut> leftOut;
  if (_setup.leftOutOfPort) leftOut = _setup.leftOutOfPort();
  if (const auto survey = _setup.survey ? _setup.survey() : std::nullopt) {
    leftOut = survey->leftOut;
    status.length = survey->length;
    status.firstTime = survey->first;
    status.lastTime = survey->last;
  }
  if (leftOut) status.badFrames = leftOut->badChecksum + leftOut->torn + leftOut->broken + leftOut->tooLong;
  if (const auto position = server.position()) {
    status.position = position->sinceStart;
    status.time = position->time;
  }
  return status;
}

}  // namespace varnel
