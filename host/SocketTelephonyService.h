#pragma once

#include <chrono>
#include <filesystem>

#include "platform/TelephonyService.h"

namespace varnel {

/// The telephony server of a runtime folder, reached over its local socket.
class SocketTelephonyService final : public TelephonyService {
 public:
  /// The folder's path is absolute. A request waits that long for its reply.
  explicit SocketTelephonyService(std::filesystem::path runtimeFolder,
                                  std::chrono::milliseconds replyTimeout = std::chrono::seconds(1))
      : _folder(std::move(runtimeFolder)), _replyTimeout(replyTimeout) {}

  /// The handler is called by the event loop, and by a request that waits for its reply. It may destroy the
  /// connection. An exception that leaves it ends the program.
  std::unique_ptr<TelephonyConnection> connect(std::function<void()> notificationHandler) override;

 private:
  std::filesystem::path _folder;
  std::chrono::milliseconds _replyTimeout;
};

}  // namespace varnel
