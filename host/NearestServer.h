#pragma once

#include <filesystem>
#include <optional>

#include "host/RuntimeFolder.h"
#include "host/SocketPorts.h"
#include "host/SocketTelephonyService.h"

namespace varnel {

/// The ports and the telephony service of a viewer that looks for a server in two runtime folders: its own
/// one, then the system's. A new local port begins a new look. If neither folder has a server, the viewer's
/// own folder is used.
class NearestServer final : public MessagePorts, public TelephonyService {
 public:
  /// `system` may not be there yet; without it, the viewer looks into its own folder alone. The monitor is
  /// told where the viewer looks. It must outlive this object, its ports and its connections.
  NearestServer(RuntimeFolder own, std::optional<std::filesystem::path> system, LinkMonitor& monitor,
                std::chrono::milliseconds replyTimeout = std::chrono::seconds(1));

  /// Looks into these folders instead, from the next local port on. The monitor forgets what was shown.
  void moveTo(RuntimeFolder own, std::optional<std::filesystem::path> system);

  LocalPortCreation createLocalPort(std::string_view name, LocalPort::MessageHandler handler) override;
  std::unique_ptr<RemotePort> createRemotePort(std::string_view name) override;
  std::unique_ptr<TelephonyConnection> connect(std::function<void()> notificationHandler) override;

 private:
  // What is made of one folder.
  struct Link {
    Link(const RuntimeFolder& folder, std::chrono::milliseconds replyTimeout, LinkMonitor& monitor)
        : ports(folder, &monitor), service(folder, replyTimeout, &monitor) {}

    SocketPorts ports;
    SocketTelephonyService service;
  };

  void look();
  void use(const RuntimeFolder& folder, std::string obstacle);

  RuntimeFolder _own;
  std::optional<std::filesystem::path> _system;
  bool _hasMoved = false;  // since the last look
  LinkMonitor& _monitor;
  const std::chrono::milliseconds _replyTimeout;
  std::optional<Link> _link;  // always there after the construction
};

}  // namespace varnel
