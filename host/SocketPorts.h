#pragma once

#include <filesystem>

#include "platform/MessagePort.h"

namespace varnel {

class LinkMonitor;

/// Named message ports as local sockets in a runtime folder, which holds one port of a name.
///
/// A local port belongs to the first process of this user or of root that connects, and ends as soon as that
/// one goes away, after all that it had sent was delivered. Whoever else connects is turned away. A remote
/// port is made at once or not at all. Every request gets an answer: when the message
/// handler returns no reply the sender learns so at once, with status 0. A reply that comes after its time is
/// dropped. What is sent without asking for a reply is queued and goes out together; sending waits only when
/// 4 MiB are queued. A message of more than 1 MiB is a transport error.
class SocketPorts final : public MessagePorts {
 public:
  /// The folder's path is absolute. The monitor, which is told how the link does, may be null; else it
  /// outlives the ports.
  explicit SocketPorts(std::filesystem::path runtimeFolder, LinkMonitor* monitor = nullptr)
      : _folder(std::move(runtimeFolder)), _monitor(monitor) {}

  /// Why a port could not be made, other than that it exists already, is told in the log.
  LocalPortCreation createLocalPort(std::string_view name, LocalPort::MessageHandler handler) override;
  std::unique_ptr<RemotePort> createRemotePort(std::string_view name) override;

 private:
  std::filesystem::path _folder;
  LinkMonitor* _monitor;
};

}  // namespace varnel
