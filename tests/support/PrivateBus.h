#pragma once

#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <system_error>

#include "tests/support/Process.h"

namespace varnel {

/// A private D-Bus session bus for the test, on which everybody may own every name.
class PrivateBus {
 public:
  /// False when the bus cannot be started on this machine, or does not take these elements of its
  /// configuration.
  bool start(const std::string& elements = {}) {
    std::ofstream(_folder.file("bus.conf"))
        << "<busconfig><type>session</type><listen>" << address()
        << "</listen><auth>EXTERNAL</auth><policy context=\"default\"><allow send_destination=\"*\" "
           "eavesdrop=\"true\"/><allow eavesdrop=\"true\"/><allow own=\"*\"/></policy>"
        << elements << "</busconfig>";
    const std::vector<std::string> arguments{"dbus-daemon", "--nofork", "--print-address",
                                             "--config-file=" + _folder.file("bus.conf")};
    _daemon = std::make_unique<Process>("/usr/bin/env", arguments);
    eventually([&] { return !_daemon->output().empty() || _daemon->waitForEnd(std::chrono::seconds(0)); });
    return !_daemon->output().empty();
  }
  /// The bus goes away with everybody's connections. It can be started again at the same address.
  void stop() {
    _daemon.reset();
    std::error_code ignored;
    std::filesystem::remove(_folder.file("bus"), ignored);
  }
  std::string address() const { return "unix:path=" + _folder.file("bus"); }
  /// The folder of its socket, which has the same name as a session's bus in its runtime folder.
  std::string folder() const { return _folder.path().string(); }

 private:
  TemporaryFolder _folder;
  std::unique_ptr<Process> _daemon;
};

}  // namespace varnel
