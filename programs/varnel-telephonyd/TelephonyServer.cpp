#include "programs/varnel-telephonyd/TelephonyServer.h"

#include <string>

#include "base/Log.h"

namespace varnel {

namespace {
constexpr std::string_view commandPortPrefix = "com.orvane.TelephonyServer.LogChannel.";
constexpr std::chrono::milliseconds viewerCheckInterval = std::chrono::seconds(1);
}  // namespace

TelephonyServer::TelephonyServer(ChannelHost host)
    : _host(std::move(host)),
      _viewerCheck(_host.queue.repeating(viewerCheckInterval, [this] { checkViewers(); })) {}

TelephonyConnection::LogChannel TelephonyServer::createLogChannel(std::string_view viewerPortName) {
  auto viewer = _host.ports.createRemotePort(viewerPortName);
  if (!viewer) {
    logWarning("A log channel was asked for port \"%s\", which does not answer", viewerPortName);
    return {viewerPortMissing, std::nullopt};
  }
  const unsigned number = freeNumber();
  const std::string portName = std::string(commandPortPrefix) + std::to_string(number);
  const auto channel = std::make_shared<ServedChannel>(_host, std::move(viewer));
  if (!channel->open(portName, [this, number] { close(number); })) {
    logError("The port \"%s\" could not be made", portName);
    return {commandPortNotMade, std::nullopt};
  }
  _channels.emplace(number, channel);
  logLine(logNoticePriority, "A log channel to port \"%s\" is open", viewerPortName);
  return {0, portName};
}

unsigned TelephonyServer::freeNumber() const {
  unsigned number = 1;
  while (_channels.contains(number)) ++number;
  return number;
}

void TelephonyServer::close(unsigned number) {
  _channels.erase(number);
  logLine(logNoticePriority, "A log channel is closed");
}

void TelephonyServer::checkViewers() {
  const auto channels = _channels;  // for a check may end its channel
  for (const auto& [number, channel] : channels) channel->checkViewer();
}

}  // namespace varnel
