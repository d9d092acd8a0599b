#pragma once

#include <chrono>

#include "host/RuntimeFolder.h"
#include "platform/TelephonyService.h"

namespace varnel {

class LinkMonitor;

/// The telephony server of a runtime folder, over its local socket.
class SocketTelephonyService final : public TelephonyService {
 public:
  /// A request waits `replyTimeout` for its reply. The monitor is told why
  /// attempts fail. It may be null, else it must outlive the service and its connections.
  explicit SocketTelephonyService(RuntimeFolder runtimeFolder,
                                  std::chrono::milliseconds replyTimeout = std::chrono::seconds(1),
                                  LinkMonitor* monitor = nullptr)
      : _folder(std::move(runtimeFolder)), _replyTimeout(replyTimeout), _monitor(monitor) {}

  /// The event loop calls the handler, and so does a request that waits for its reply. The handler may
  /// destroy the connection. An exception that leaves it ends the program.
  std::unique_ptr<TelephonyConnection> connect(std::function<void()> notificationHandler) override;

 private:
  RuntimeFolder _folder;
  std::chrono::milliseconds _replyTimeout;
  LinkMonitor* _monitor;
};

}  // namespace varnel
