#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "tests/support/Process.h"

namespace varnel {

/// The real ModemManager on a private bus, with a modem whose AT commands the script at-modem plays. It sees
/// nothing of this machine: it does not scan, and asks neither udev nor the service manager.
class RealModemManager {
 public:
  explicit RealModemManager(std::string busAddress)
      : _environment{"DBUS_SESSION_BUS_ADDRESS=" + busAddress, "DBUS_SYSTEM_BUS_ADDRESS=" + busAddress} {}

  /// Starts the service, without a modem.
  void start() {
    const std::vector<std::string> arguments{"--test-session",
                                             "--test-enable",
                                             "--no-auto-scan",
                                             "--test-no-udev",
                                             "--test-no-suspend-resume",
                                             "--test-no-qrtr",
                                             "--log-file=" + _folder.file("log"),
                                             "--log-level=WARN"};
    _service = std::make_unique<Process>("/usr/sbin/ModemManager", arguments, _environment);
  }
  /// The service ends as when its user stops it.
  void stop() {
    _service->signal(SIGTERM);
    EXPECT_TRUE(_service->waitForEnd());
    _service.reset();
  }
  /// Plugs the modem in, as soon as the service runs.
  void plugIn() {
    std::filesystem::remove(port());
    _modem = std::make_unique<Process>(VARNEL_SOURCE_DIR "/tests/support/at-modem",
                                       std::vector<std::string>{port()});
    EXPECT_TRUE(eventually([this] { return std::filesystem::exists(port()); }));
    EXPECT_TRUE(eventually([this] {
      return run("/usr/bin/gdbus",
                 {"call", "--session", "-d", "org.freedesktop.ModemManager1", "-o",
                  "/org/freedesktop/ModemManager1", "-m", "org.freedesktop.ModemManager1.Test.SetProfile",
                  "profile", "generic", "['" + port() + "']"});
    })) << contentsOf(_folder.file("log"));
  }
  /// Pulls the modem out.
  void unplug() { _modem.reset(); }
  /// Switches the modem on, as soon as the service knows it.
  void enable() const {
    EXPECT_TRUE(eventually([this] {
      return run("/usr/bin/mmcli", {"-m", "any", "--enable"});
    })) << contentsOf(_folder.file("log"));
  }
  bool run(const std::string& program, const std::vector<std::string>& arguments) const {
    Process process(program, arguments, _environment);
    return process.waitForEnd() && process.exitStatus() == 0;
  }

 private:
  std::string port() const { return _folder.file("port"); }

  TemporaryFolder _folder;
  const std::vector<std::string> _environment;
  std::unique_ptr<Process> _service, _modem;
};

}  // namespace varnel
