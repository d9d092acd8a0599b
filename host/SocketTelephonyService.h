#pragma once

#include <chrono>
#include <filesystem>

#include "platform/TelephonyService.h"

namespace varnel {

class LinkMonitor;

/// The telephony server of a runtime folder, reached over its local socket.
class SocketTelephonyService final : public TelephonyService {
 public:
  /// The folder's path is absolute. A request waits that long for its reply. The monitor, which is told why
  /// attempts fail, may be null; else it outlives the service and its connections.
  explicit SocketTelephonyService(std::filesystem::path runtimeFolder,
                                  std::chrono::milliseconds replyTimeout = std::chrono::seconds(1),
                                  LinkMonitor* monitor = nullptr)
      : _folder(std::move(runtimeFolder)), _replyTimeout(replyTimeout), _monitor(monitor) {}

  /// The handler is called by the event loop, and by a request that waits for its reply. It may destroy the
  /// connection. An exception that leaves it ends the program.
  std::unique_ptr<TelephonyConnection> connect(std::function<void()> notificationHandler) override;

 private:
  std::filesystem::path _folder;
  std::chrono::milliseconds _replyTimeout;
  LinkMonitor* _monitor;
};

}  // namespace varnel
