#pragma once

#include <QObject>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <utility>

#include "host/ControlProtocol.h"
#include "host/RuntimeFolder.h"
#include "host/SocketConnection.h"

namespace varnel {

/// Controls a running telephony server like `ServerControl`, but waits for nothing: replies come from the
/// event loop, in the order of the requests.
class ControlClient final {
 public:
  /// Gets the reply; nothing when no server is there, or when it has gone.
  using Reply = std::function<void(const std::optional<ControlReply>& reply)>;

  explicit ControlClient(RuntimeFolder runtimeFolder) : _folder(std::move(runtimeFolder)) {}
  ControlClient(const ControlClient&) = delete;
  ControlClient& operator=(const ControlClient&) = delete;

  /// Connects if that is needed, and sends the request. The reply is never called from within, and not after
  /// the end of this object. It must not destroy this object.
  void ask(const ControlRequest& request, Reply reply);
  bool isWaiting() const { return !_waiting.empty(); }

 private:
  struct Waiting {
    Reply take;
    bool isSent;  // false: no server was there
  };

  bool connect();
  void takeReplies();
  void giveUpUnsent();
  void giveUp();

  const RuntimeFolder _folder;
  std::unique_ptr<SocketConnection> _connection;
  std::deque<Waiting> _waiting;
  QObject _context;  // of calls that the event loop is to make
};

}  // namespace varnel
