#pragma once

#include <filesystem>
#include <functional>
#include <memory>
#include <vector>

#include "host/ControlProtocol.h"
#include "host/SocketServer.h"

namespace varnel {

/// Takes requests to the running server over a socket of the runtime folder, from the own user and root,
/// also when a group may connect as viewers. There are 16 connections at most. A connection that sends
/// anything but requests is ended.
class ControlListener final {
 public:
  using Answer = std::function<ControlReply(const ControlRequest& request)>;

  /// Listens at once; the event loop calls the function for each request. Throws std::runtime_error when the
  /// socket cannot be made.
  ControlListener(const std::filesystem::path& runtimeFolder, Answer answer,
                  const SocketLimits& limits = {.connections = 16});
  ControlListener(const ControlListener&) = delete;
  ControlListener& operator=(const ControlListener&) = delete;
  ~ControlListener();

 private:
  using Client = std::shared_ptr<SocketConnection>;

  void add(Client client);
  void serve(const Client& client);
  bool answerOne(SocketConnection& client, const Frame& frame) const;

  const Answer _answer;
  std::vector<Client> _clients;
  std::unique_ptr<SocketServer> _server;
};

}  // namespace varnel
