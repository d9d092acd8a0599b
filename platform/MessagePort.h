#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string_view>

#include "base/Bytes.h"

namespace varnel {

/// The receiving end of a named message port. The destructor frees the name and does not call the
/// invalidation handler.
class LocalPort {
 public:
  /// Takes one message and returns the reply, if there is one. The port calls it on the main queue. An
  /// exception that leaves it ends the program.
  using MessageHandler = std::function<std::optional<Bytes>(std::int32_t identifier, ByteView data)>;
  using InvalidationHandler = std::function<void()>;

  virtual ~LocalPort() = default;
  /// The port delivers messages from this call on.
  virtual void deliverOnMainQueue() = 0;
  /// An empty handler removes the handler that is set.
  virtual void setInvalidationHandler(InvalidationHandler handler) = 0;
  /// Ends the port and then calls the invalidation handler, which may destroy the port. The same happens when
  /// the peer goes away. A second call does nothing.
  virtual void invalidate() = 0;
};

/// The sending end of another process's port.
class RemotePort {
 public:
  struct SendResult {
    std::int32_t status = 0;     ///< 0 when the message was sent; else one of the codes below
    std::optional<Bytes> reply;  ///< absent when no reply was asked for, or none came
  };
  static constexpr std::int32_t sendTimeout = -1;
  static constexpr std::int32_t receiveTimeout = -2;
  static constexpr std::int32_t isInvalid = -3;
  static constexpr std::int32_t transportError = -4;
  static constexpr std::int32_t becameInvalid = -5;

  virtual ~RemotePort() = default;
  /// Sends one message. With a reply time-out it waits that long for the reply, and nothing else is delivered
  /// meanwhile. Without a reply time-out it asks for no reply.
  virtual SendResult sendRequest(std::int32_t identifier, ByteView data, std::chrono::milliseconds timeout,
                                 std::optional<std::chrono::milliseconds> replyTimeout) = 0;
  virtual bool isValid() const = 0;
  virtual void invalidate() = 0;
};

/// Makes ports with given names.
class MessagePorts {
 public:
  struct LocalPortCreation {
    std::unique_ptr<LocalPort> port;  ///< null when the port could not be made
    bool alreadyExists = false;       ///< there is already a port of that name
  };

  virtual ~MessagePorts() = default;
  virtual LocalPortCreation createLocalPort(std::string_view name, LocalPort::MessageHandler handler) = 0;
  /// Null when no port of that name answers.
  virtual std::unique_ptr<RemotePort> createRemotePort(std::string_view name) = 0;
};

}  // namespace varnel
