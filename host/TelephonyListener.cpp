#include "host/TelephonyListener.h"

#include <algorithm>
#include <utility>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "host/TelephonyProtocol.h"

namespace varnel {

namespace {

namespace protocol = telephonyProtocol;

// A viewer tries again after five seconds.
constexpr std::chrono::milliseconds clearingInterval = std::chrono::seconds(2);

bool isText(const Value& value, std::string_view text) { return value.string() && *value.string() == text; }

std::optional<Bytes> replyOf(const TelephonyConnection::LogChannel& channel) {
  Value reply = Value::ofDictionary();
  reply.dictionary()->set(protocol::errorKey, Value::ofInteger(channel.error));
  if (channel.portName) reply.dictionary()->set(protocol::portNameKey, *channel.portName);
  return writeXmlPropertyList(reply);
}

// The reply that a client gets whose connection is refused, as if it had asked.
Bytes refusal(std::int64_t error) {
  Bytes bytes;
  const auto reply = replyOf({error, std::nullopt});
  appendFrame(bytes, {0, FrameMark::Reply, reply.value()});
  return bytes;
}

}  // namespace

TelephonyListener::TelephonyListener(const RuntimeFolder& folder, LogChannelMaker makeLogChannel,
                                     const SocketLimits& limits, RightsGranter rightsOf)
    : _makeLogChannel(std::move(makeLogChannel)),
      _stay(limits.stay),
      _server(std::make_unique<SocketServer>(
          socketPath(folder.path, protocol::socketName),
          [this](std::unique_ptr<SocketConnection> client) { add(std::move(client)); }, limits,
          gate(folder, std::move(rightsOf)))) {
  if (!folder.access.isShared()) return;
  _clearing.callOnTimeout([path = folder.path] { removeLeftovers(path); });
  _clearing.start(clearingInterval);
}

TelephonyListener::~TelephonyListener() = default;

SocketGate TelephonyListener::gate(const RuntimeFolder& folder, RightsGranter rightsOf) {
  if (!rightsOf) rightsOf = [access = folder.access](const Peer& peer) { return access.rightsOf(peer); };
  return {.access = folder.access,
          .ownsName = true,
          .accepts =
              [rightsOf = std::move(rightsOf)](const Peer& peer) {
                const Rights rights = rightsOf(peer);
                return rights.spi && rights.internal;
              },
          .refusalOfStranger = refusal(protocol::missingRights),
          .refusalWhenFull = refusal(protocol::tooManyConnections),
          .makeRoom = [this] { makeRoom(); }};
}

void TelephonyListener::makeRoom() {
  if (!_guests.empty() && _guests.front().stay.hasExpired(_stay.count())) _guests.erase(_guests.begin());
}

void TelephonyListener::notifyAll() {
  for (const Guest& guest : _guests) guest.client->send({0, FrameMark::Notification, {}});
}

void TelephonyListener::add(Client client) {
  client->setActivityHandler([this, weak = std::weak_ptr(client)] { serve(weak.lock()); });
  client->send({0, FrameMark::Notification, {}});
  _guests.push_back({std::move(client), {}, {}});
  _guests.back().stay.start();
}

void TelephonyListener::serve(const Client& client) {
  while (const auto frame = client->nextFrame()) {
    if (frame->mark != FrameMark::Request) continue;
    const auto reply = replyOf(answer(client, frame->payload));
    client->send({frame->identifier, reply ? FrameMark::Reply : FrameMark::NoReply, reply.value_or(Bytes())});
  }
  if (!client->isOpen()) std::erase_if(_guests, [&](const Guest& guest) { return guest.client == client; });
}

TelephonyConnection::LogChannel TelephonyListener::answer(const Client& client, ByteView request) {
  const auto list = readPropertyList(request);
  const Dictionary* const fields = list ? list->dictionary() : nullptr;
  if (!fields) return {protocol::malformedRequest, std::nullopt};
  if (!isText(fields->get(protocol::commandKey), protocol::createLogChannel))
    return {protocol::unknownCommand, std::nullopt};
  const std::string* const localPortName = fields->get(protocol::portNameKey).string();
  if (!localPortName) return {protocol::malformedRequest, std::nullopt};
  const auto guest = std::ranges::find(_guests, client, &Guest::client);
  if (guest != _guests.end()) guest->portName = *localPortName;
  return _makeLogChannel(*localPortName);
}

std::size_t TelephonyListener::clients(const std::set<std::string, std::less<>>& portsWithChannels) const {
  const auto others = std::ranges::count_if(
      _guests, [&](const Guest& guest) { return !portsWithChannels.contains(guest.portName); });
  return portsWithChannels.size() + static_cast<std::size_t>(others);
}

}  // namespace varnel
