#include "host/TelephonyListener.h"

#include <algorithm>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "host/TelephonyProtocol.h"

namespace varnel {

namespace {

namespace protocol = telephonyProtocol;

bool isText(const Value& value, std::string_view text) { return value.string() && *value.string() == text; }

bool holdsRight(const Dictionary& request, std::string_view right) {
  const Array* const rights = request.get(protocol::rightsKey).array();
  return rights && std::ranges::any_of(*rights, [&](const Value& held) { return isText(held, right); });
}

std::optional<Bytes> replyOf(const TelephonyConnection::LogChannel& channel) {
  Value reply = Value::ofDictionary();
  reply.dictionary()->set(protocol::errorKey, Value::ofInteger(channel.error));
  if (channel.portName) reply.dictionary()->set(protocol::portNameKey, *channel.portName);
  return writeXmlPropertyList(reply);
}

// The reply that a client gets when there is no room for it, as if it had asked.
Bytes refusal() {
  Bytes bytes;
  const auto reply = replyOf({protocol::tooManyConnections, std::nullopt});
  appendFrame(bytes, {0, FrameMark::Reply, reply.value()});
  return bytes;
}

}  // namespace

TelephonyListener::TelephonyListener(const std::filesystem::path& runtimeFolder,
                                     LogChannelMaker makeLogChannel, const SocketLimits& limits)
    : _makeLogChannel(std::move(makeLogChannel)),
      _server(std::make_unique<SocketServer>(
          socketPath(runtimeFolder, protocol::socketName),
          [this](std::unique_ptr<SocketConnection> client) { add(std::move(client)); }, limits, refusal())) {}

TelephonyListener::~TelephonyListener() = default;

void TelephonyListener::notifyAll() {
  for (const Client& client : _clients) client->send({0, FrameMark::Notification, {}});
}

void TelephonyListener::add(Client client) {
  client->setActivityHandler([this, weak = std::weak_ptr(client)] { serve(weak.lock()); });
  client->send({0, FrameMark::Notification, {}});
  _clients.push_back(std::move(client));
}

void TelephonyListener::serve(const Client& client) {
  while (const auto frame = client->nextFrame()) {
    if (frame->mark != FrameMark::Request) continue;
    const auto reply = replyOf(answer(frame->payload));
    client->send({frame->identifier, reply ? FrameMark::Reply : FrameMark::NoReply, reply.value_or(Bytes())});
  }
  if (!client->isOpen()) std::erase(_clients, client);
}

TelephonyConnection::LogChannel TelephonyListener::answer(ByteView request) const {
  const auto list = readPropertyList(request);
  const Dictionary* const fields = list ? list->dictionary() : nullptr;
  if (!fields) return {protocol::malformedRequest, std::nullopt};
  if (!isText(fields->get(protocol::commandKey), protocol::createLogChannel))
    return {protocol::unknownCommand, std::nullopt};
  const std::string* const localPortName = fields->get(protocol::portNameKey).string();
  if (!localPortName) return {protocol::malformedRequest, std::nullopt};
  if (!holdsRight(*fields, protocol::spiRight) || !holdsRight(*fields, protocol::internalRight))
    return {protocol::missingRights, std::nullopt};
  return _makeLogChannel(*localPortName);
}

}  // namespace varnel
