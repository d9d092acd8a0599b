#pragma once

#include <cstddef>
#include <filesystem>
#include <functional>
#include <memory>
#include <string_view>
#include <vector>

#include "base/Bytes.h"
#include "host/SocketServer.h"
#include "platform/TelephonyService.h"

namespace varnel {

/// The server's side of the telephony service. It takes connections, checks requests, and notifies clients.
/// Every new connection gets one notification at once.
class TelephonyListener final {
 public:
  /// Makes the log channel that delivers to the client's local port of this name. An exception that leaves it
  /// ends the program.
  using LogChannelMaker = std::function<TelephonyConnection::LogChannel(std::string_view localPortName)>;

  /// Listens at once; everything happens on the event loop. The folder's path is absolute. Throws
  /// std::runtime_error when another server runs in this folder, or when the socket cannot be made.
  TelephonyListener(const std::filesystem::path& runtimeFolder, LogChannelMaker makeLogChannel,
                    const SocketLimits& limits = {});
  TelephonyListener(const TelephonyListener&) = delete;
  TelephonyListener& operator=(const TelephonyListener&) = delete;
  ~TelephonyListener();

  /// Sends a notification to every open connection.
  void notifyAll();
  /// How many connections are open.
  std::size_t clients() const { return _clients.size(); }

 private:
  using Client = std::shared_ptr<SocketConnection>;

  void add(Client client);
  void serve(const Client& client);
  TelephonyConnection::LogChannel answer(ByteView request) const;

  LogChannelMaker _makeLogChannel;
  std::vector<Client> _clients;
  std::unique_ptr<SocketServer> _server;
};

}  // namespace varnel
