#include "programs/varnel-telephonyd/ControlListener.h"

#include <algorithm>

#include "base/Log.h"

namespace varnel {

namespace {

// After this many, others get a turn.
constexpr int requestsAtATime = 16;

// The reply that a client gets whose connection is refused, as if it had asked.
Bytes refusal(const std::string& sentence) {
  Bytes bytes;
  const Bytes reply = controlProtocol::writeReply(ControlRefusal{sentence});
  appendFrame(bytes, {0, FrameMark::Reply, reply});
  return bytes;
}

}  // namespace

ControlListener::ControlListener(const std::filesystem::path& runtimeFolder, Answer answer,
                                 const SocketLimits& limits)
    : _answer(std::move(answer)),
      _server(std::make_unique<SocketServer>(
          socketPath(runtimeFolder, controlProtocol::socketName),
          [this](std::unique_ptr<SocketConnection> client) { add(std::move(client)); }, limits,
          SocketGate{.ownsName = true,
                     .refusalOfStranger =
                         refusal("the telephony server obeys nobody but its own user; become that user"),
                     .refusalWhenFull = refusal(
                         "the telephony server is controlled by as many programs as it takes; end one of "
                         "them")})) {}

ControlListener::~ControlListener() = default;

void ControlListener::add(Client client) {
  client->setActivityHandler([this, weak = std::weak_ptr(client)] { serve(weak.lock()); });
  _clients.push_back(std::move(client));
}

void ControlListener::serve(const Client& client) {
  bool isUnderstood = true;
  int count = 0;
  while (isUnderstood && count++ < requestsAtATime) {
    const auto frame = client->nextFrame();
    if (!frame) break;
    isUnderstood = answerOne(*client, *frame);
  }
  if (isUnderstood && client->isOpen()) {
    if (count > requestsAtATime) client->wake();
    return;
  }
  if (!isUnderstood) logWarning("A request to the server cannot be understood: its connection ends");
  std::erase(_clients, client);
}

bool ControlListener::answerOne(SocketConnection& client, const Frame& frame) const {
  const auto request =
      frame.mark == FrameMark::Request ? controlProtocol::readRequest(frame.payload) : std::nullopt;
  if (!request) {
    const ControlRefusal refusal{
        "the telephony server does not understand this; use programs of one version"};
    client.send({frame.identifier, FrameMark::Reply, controlProtocol::writeReply(refusal)});
    return false;
  }
  client.send({frame.identifier, FrameMark::Reply, controlProtocol::writeReply(_answer(*request))});
  return true;
}

}  // namespace varnel
