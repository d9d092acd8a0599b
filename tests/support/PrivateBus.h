#pragma once

#include <fstream>
#include <memory>
#include <string>

#include "tests/support/Process.h"

namespace varnel {

/// A D-Bus session bus of the test's own, on which anybody may own any name.
class PrivateBus {
 public:
  /// False where the machine has no bus to start.
  bool start() {
    std::ofstream(_folder.file("bus.conf"))
        << "<busconfig><type>session</type><listen>" << address()
        << "</listen><auth>EXTERNAL</auth><policy context=\"default\"><allow send_destination=\"*\" "
           "eavesdrop=\"true\"/><allow eavesdrop=\"true\"/><allow own=\"*\"/></policy></busconfig>";
    const std::vector<std::string> arguments{"dbus-daemon", "--nofork", "--print-address",
                                             "--config-file=" + _folder.file("bus.conf")};
    _daemon = std::make_unique<Process>("/usr/bin/env", arguments);
    eventually([&] { return !_daemon->output().empty() || _daemon->waitForEnd(std::chrono::seconds(0)); });
    return !_daemon->output().empty();
  }
  std::string address() const { return "unix:path=" + _folder.file("bus"); }
  /// Where its socket lies, under the name that a session's bus has in its runtime folder.
  std::string folder() const { return _folder.path().string(); }

 private:
  TemporaryFolder _folder;
  std::unique_ptr<Process> _daemon;
};

}  // namespace varnel
