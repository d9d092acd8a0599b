#include "model/VarnelModel.h"

#include "base/Log.h"
#include "base/PropertyList.h"

namespace varnel {

namespace {

using namespace std::chrono_literals;

constexpr std::string_view logChannelName = "com.orvane.BasebandStateReport.LogChannel";
constexpr std::string_view getTechnologyKey = "GetTechnology";
constexpr std::int32_t logMessageIdentifier = 0;
constexpr std::chrono::milliseconds sendTimeout = 1s;
constexpr std::chrono::milliseconds replyTimeout = 1s;
constexpr std::chrono::milliseconds refreshInterval = 2s;
constexpr std::chrono::milliseconds retryDelay = 5s;
// The known names are shorter. A strange server may send anything.
constexpr std::size_t longestTechnologyKept = 64;

// The technology in the reply. Without one logs why and returns nothing.
std::optional<Value> technologyIn(ByteView reply) {
  const auto list = readPropertyList(reply);
  const Dictionary* answers = list ? list->dictionary() : nullptr;
  if (!answers) {
    logError(" ***** Could not parse reply to GetTechnology; cannot configure");
    return std::nullopt;
  }
  const Value& technology = answers->get(getTechnologyKey);
  if (technology.isAbsent()) {
    logError(" ***** Reply to GetTechnology had no answer; cannot configure");
    return std::nullopt;
  }
  return technology;
}

}  // namespace

VarnelModel::VarnelModel(const ModelServices& services, VarnelModelObserver& observer)
    : _services(services), _observer(observer) {}

VarnelModel::~VarnelModel() { destroyPorts(); }

void VarnelModel::restartMonitor() {
  destroyPorts();
  startMonitor();
}

void VarnelModel::restartMonitorLater() {
  _services.queue.async(_whileAlive([this] { restartMonitor(); }));
}

void VarnelModel::startMonitor() {
  if (_displayUpdateTimer) return;
  if (startStream()) return _observer.linkWasOpened();
  retryLater();
  _observer.linkWasLookedAt();
}

bool VarnelModel::startStream() {
  _streamFailure = failureToStart();
  return _streamFailure == StreamFailure::None;
}

StreamFailure VarnelModel::failureToStart() {
  if (!createPorts()) {
    logError("Could not create the ports necessary");
    return StreamFailure::Link;
  }
  if (!_logGenerator) _technology.clear();
  configureGenerator();
  if (!_logGenerator) {
    logError("No log generator technology works");
    return _technology.empty() ? StreamFailure::NoTechnology : StreamFailure::UnknownTechnology;
  }
  const auto command = _services.writePropertyList(_logGenerator->getStartCommand());
  if (!command) {
    logError(" Could not generate PLIST");
    return StreamFailure::Command;
  }
  if (const auto sent = send(*command, std::nullopt); sent.status != 0) {
    logError(" ***** Could not send the START command (got error=%d)", sent.status);
    return StreamFailure::Command;
  }
  // Kept: a success, logged as an error.
  logError("Starting the display update timer");
  _displayUpdateTimer = _services.queue.repeating(refreshInterval, _whileAlive([this] { refresh(); }));
  return StreamFailure::None;
}

void VarnelModel::retryLater() {
  destroyPorts();
  _services.queue.after(retryDelay, _whileAlive([this] { startMonitor(); }));
}

bool VarnelModel::createPorts() {
  if (!createLocalPort()) return false;
  const auto portName = createLogChannel();
  if (!portName || !createRemotePort(*portName)) return false;
  // Kept: a success, logged as an error.
  logError(" ***** Created ports (send=%p, recv=%p)", static_cast<const void*>(_sendPort.get()),
           static_cast<const void*>(_recvPort.get()));
  return true;
}

bool VarnelModel::createLocalPort() {
  auto created = _services.ports.createLocalPort(
      logChannelName, [this](std::int32_t identifier, ByteView data) noexcept -> std::optional<Bytes> {
        if (identifier == logMessageIdentifier) updateWithData(data);
        return std::nullopt;
      });
  _recvPort = std::move(created.port);
  if (created.alreadyExists) {
    // Kept: three s.
    logError("Local messsage port already exists");
    return false;
  }
  if (!_recvPort) {
    logError("Could not create local message port");
    return false;
  }
  _recvPort->deliverOnMainQueue();
  _recvPort->setInvalidationHandler([this, port = _recvPort.get()] { localPortWasInvalidated(port); });
  return true;
}

std::optional<std::string> VarnelModel::createLogChannel() {
  auto connection = _services.telephony.connect(_whileAlive([this] { refresh(); }));
  if (!connection) {
    logError("Could not create TKServerConnection");
    return std::nullopt;
  }
  const auto channel = connection->createLogChannel(logChannelName);
  connection.reset();
  if (channel.error != 0) {
    logError("_TKServerConnectionNetworkMonitorCreateLogChannel returns error: %ld!", channel.error);
    return std::nullopt;
  }
  if (!channel.portName || channel.portName->empty()) {
    logError("Could not create a log channel (TK returned null port)!");
    return std::nullopt;
  }
  return channel.portName;
}

bool VarnelModel::createRemotePort(const std::string& name) {
  _sendPort = _services.ports.createRemotePort(name);
  if (!_sendPort) logError("Could not create the remote port!");
  return _sendPort != nullptr;
}

void VarnelModel::destroyPorts() {
  _displayUpdateTimer.reset();
  // The handler goes first. Otherwise invalidating the port would restart the monitor, as if the service had
  // gone away.
  if (_recvPort) {
    _recvPort->setInvalidationHandler({});
    _recvPort->invalidate();
    _recvPort.reset();
  }
  if (_sendPort) {
    _sendPort->invalidate();
    _sendPort.reset();
  }
}

RemotePort::SendResult VarnelModel::send(ByteView command,
                                         std::optional<std::chrono::milliseconds> replyWait) {
  return _sendPort->sendRequest(logMessageIdentifier, command, sendTimeout, replyWait);
}

void VarnelModel::configureGenerator() {
  const auto technology = askForTechnology();
  if (!technology) return;
  _logGenerator = LogGenerator::generatorFromTechnology(*technology, _services.generator);
  // Kept: "generated" for "generator". The line is an error in both cases, and null means that there is none.
  logError("Got log generated: %p", static_cast<const void*>(_logGenerator.get()));
  _technology = technology->string() ? technology->string()->substr(0, longestTechnologyKept) : std::string();
  noteWhetherDisplayStands();
}

std::optional<Value> VarnelModel::askForTechnology() {
  Value request = Value::ofDictionary();
  request.dictionary()->set(getTechnologyKey, getTechnologyKey);
  const auto command = _services.writePropertyList(request);
  if (!command) {
    logError(" Could not generate GetTechnology command; cannot configure");
    return std::nullopt;
  }
  const auto sent = send(*command, replyTimeout);
  if (sent.status != 0) {
    logError(" ***** Could not send the GetTechnology command (got error=%d)", sent.status);
    return std::nullopt;
  }
  if (!sent.reply) {
    logError(" ***** No response to GetTechnology; cannot configure");
    return std::nullopt;
  }
  return technologyIn(*sent.reply);
}

// The state outlives the generators, so it can have a display to which a new generator cannot write.
void VarnelModel::noteWhetherDisplayStands() {
  if (!_logGenerator) return;
  if (_logGenerator->changesDisplayOf(_state)) {
    _displayTechnology = _technology;
    _standingDisplay.reset();
  } else if (!_standingDisplay) {
    _standingDisplay = {_displayTechnology, _services.generator.clock.now()};
  }
}

void VarnelModel::refresh() {
  if (isConnected() && !_sendPort->isValid()) _recvPort->invalidate();
  if (!_updated) return _observer.linkWasLookedAt();
  _updated = false;
  _nodes.reset();
  _nodesByPath.reset();
  _services.queue.async(_whileAlive([this] { _observer.updateViewControllerFromModel(); }));
}

// restartMonitor destroys the port and the handler that runs this; touch neither afterwards.
void VarnelModel::localPortWasInvalidated(const LocalPort* port) {
  logError(" ***** INVALIDATED %p *****", static_cast<const void*>(port));
  restartMonitor();
  _observer.linkWasLost();
}

void VarnelModel::updateWithData(ByteView data) {
  if (_logGenerator) _logGenerator->updateState_withData(_state, data);
  _updated = true;
}

void VarnelModel::showDisplay(const Value& display) {
  _nodesByPath.emplace();
  _nodes = VarnelModelNode::makeTreeFromObject_withPathDictionary(display, *_nodesByPath);
  _observer.updateViewControllerFromModel();
}

std::shared_ptr<const VarnelModelNode> VarnelModel::topLevelNodes() {
  if (_nodes || !_logGenerator) return _nodes;
  const Value display = _logGenerator->generateLogUsingState(_state);
  _nodesByPath.emplace();
  _nodes = VarnelModelNode::makeTreeFromObject_withPathDictionary(display, *_nodesByPath, *_logGenerator);
  return _nodes;
}

std::shared_ptr<const VarnelModelNode> VarnelModel::nodeAtPath(const std::string& path) {
  if (!_nodesByPath) topLevelNodes();
  if (!_nodesByPath) return nullptr;
  const auto found = _nodesByPath->find(path);
  return found == _nodesByPath->end() ? nullptr : found->second;
}

bool VarnelModel::hasHistory() const {
  const Array* history = _state.get(stateKey::history).array();
  return history && !history->empty();
}

std::optional<std::string> VarnelModel::missingTemplate() const {
  return _logGenerator ? _logGenerator->missingTemplate() : std::nullopt;
}

NumberFormats VarnelModel::numberFormats() const {
  return _logGenerator ? _logGenerator->numberFormats() : NumberFormats();
}

std::uint64_t VarnelModel::messagesNotDecoded() const {
  return _logGenerator ? _logGenerator->messagesNotDecoded() : 0;
}

Value VarnelModel::getSaveContents() const {
  return _logGenerator ? _logGenerator->getSaveContentsFromState(_state) : Value();
}

std::uint64_t VarnelModel::messagesLeftOutOfLog() const {
  return _logGenerator ? _logGenerator->messagesLeftOutOfLog() : 0;
}

}  // namespace varnel
