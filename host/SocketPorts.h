#pragma once

#include "host/RuntimeFolder.h"
#include "platform/MessagePort.h"

namespace varnel {

class LinkMonitor;

/// Named message ports as local sockets in a runtime folder, which holds at most one port per name.
///
/// A local port belongs to the first process that connects and that the folder's access accepts. Every other
/// process is refused. When that process goes away, the port delivers all that it had sent, and then ends. A
/// remote port is made at once or not at all.
///
/// Every request gets an answer: when the message handler returns no reply, the sender learns so at once,
/// with status 0. A reply that comes too late is dropped. Messages without a reply are queued and sent
/// together; sending waits only when 4 MiB are queued. A message of more than 1 MiB is a transport error.
class SocketPorts final : public MessagePorts {
 public:
  /// The monitor is told what happens to the link. It may be null, else it must outlive the ports.
  explicit SocketPorts(RuntimeFolder runtimeFolder, LinkMonitor* monitor = nullptr)
      : _folder(std::move(runtimeFolder)), _monitor(monitor) {}

  /// When a port cannot be made for another reason than an existing one, a log line says why.
  LocalPortCreation createLocalPort(std::string_view name, LocalPort::MessageHandler handler) override;
  std::unique_ptr<RemotePort> createRemotePort(std::string_view name) override;

 private:
  RuntimeFolder _folder;
  LinkMonitor* _monitor;
};

}  // namespace varnel
