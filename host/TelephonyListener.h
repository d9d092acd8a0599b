#pragma once

#include <QElapsedTimer>
#include <QTimer>
#include <cstddef>
#include <functional>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "base/Bytes.h"
#include "host/RuntimeFolder.h"
#include "host/SocketServer.h"
#include "platform/TelephonyService.h"

namespace varnel {

/// The server's side of the telephony service. It takes connections of clients that hold the rights "spi" and
/// "internal", checks requests, and notifies clients. Every new connection gets one notification at once.
/// When there is no room, the client that came first has to go, unless it has just come. In a shared folder
/// the listener removes the ports that killed viewers have left behind.
class TelephonyListener final {
 public:
  /// Makes the log channel that delivers to the client's local port of this name. An exception that leaves it
  /// ends the program.
  using LogChannelMaker = std::function<TelephonyConnection::LogChannel(std::string_view localPortName)>;

  /// The rights of the user behind a connection.
  using RightsGranter = std::function<Rights(const Peer& peer)>;

  /// Listens at once; everything happens on the event loop. Without a granter, the folder's access grants the
  /// rights. Throws std::runtime_error when another server runs in this folder, or when the socket cannot be
  /// made.
  TelephonyListener(const RuntimeFolder& folder, LogChannelMaker makeLogChannel,
                    const SocketLimits& limits = {}, RightsGranter rightsOf = {});
  TelephonyListener(const TelephonyListener&) = delete;
  TelephonyListener& operator=(const TelephonyListener&) = delete;
  ~TelephonyListener();

  /// Sends a notification to every open connection.
  void notifyAll();
  /// How many clients there are: those with these ports, which have channels, and all others that are
  /// connected. A client has one port. It may stay connected when it has its channel, or not.
  std::size_t clients(const std::set<std::string, std::less<>>& portsWithChannels) const;

 private:
  using Client = std::shared_ptr<SocketConnection>;

  // A client, and how long it has been connected.
  struct Guest {
    Client client;
    QElapsedTimer stay;
    std::string portName;  // for which it has asked for a channel; empty before that
  };

  SocketGate gate(const RuntimeFolder& folder, RightsGranter rightsOf);
  void add(Client client);
  void makeRoom();
  void serve(const Client& client);
  TelephonyConnection::LogChannel answer(const Client& client, ByteView request);

  LogChannelMaker _makeLogChannel;
  const std::chrono::milliseconds _stay;
  std::vector<Guest> _guests;  // the one that came first is the first
  std::unique_ptr<SocketServer> _server;
  QTimer _clearing;
};

}  // namespace varnel
