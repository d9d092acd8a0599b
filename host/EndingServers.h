#pragma once

#include <QObject>
#include <cstddef>
#include <memory>
#include <vector>

#include "host/ChildServer.h"

namespace varnel {

/// Servers of which this process needs nothing any more. They end while the event loop goes on.
class EndingServers final {
 public:
  EndingServers() = default;
  EndingServers(const EndingServers&) = delete;
  EndingServers& operator=(const EndingServers&) = delete;
  /// Waits until all of them have ended, but for three seconds at most, and then kills those that have not.
  ~EndingServers() = default;

  /// Asks the server to end, and lets it go when it has ended. Nothing is done without a server. Must not be
  /// called by a handler of the server.
  void add(std::unique_ptr<ChildServer> server);
  std::size_t size() const { return _servers.size(); }

 private:
  std::vector<std::unique_ptr<ChildServer>> _servers;
  QObject _context;  // of calls that the event loop is to make
};

}  // namespace varnel
