#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "tests/support/Process.h"

namespace varnel {

/// A service that speaks like ModemManager on a private bus, in a process of its own. The script
/// mock-modem-manager says what it can do.
class MockModemManager {
 public:
  explicit MockModemManager(std::string busAddress)
      : _environment{"DBUS_SESSION_BUS_ADDRESS=" + std::move(busAddress)} {}

  /// Starts the service, without a modem.
  void start() {
    _service = std::make_unique<Process>(script, std::vector<std::string>{"serve"}, _environment);
    const bool hasStarted = eventually([this] { return run({"remove", "none"}, Failures::AreExpected); });
    EXPECT_TRUE(hasStarted) << _service->error();
  }
  void stop() { _service.reset(); }

  /// Actions in the script's words, such as {"add", "0", "then", "cells", "0", "lte"}.
  void does(const std::vector<std::string>& actions) const { run(actions, Failures::AreReported); }
  /// The calls that the service has got, each in a line.
  std::string calls() const { return _service->output(); }

 private:
  enum class Failures { AreExpected, AreReported };
  static constexpr const char* script = VARNEL_SOURCE_DIR "/tests/support/mock-modem-manager";

  // Whether the service has taken the actions. It answers that there is no such modem once it runs.
  bool run(const std::vector<std::string>& actions, Failures failures) const {
    Process program(script, actions, _environment);
    EXPECT_TRUE(program.waitForEnd());
    const bool isExpected = program.exitStatus() == 0 || failures == Failures::AreExpected;
    EXPECT_TRUE(isExpected) << program.error();
    return program.exitStatus() == 0 || program.error().find("does not exist") != std::string::npos;
  }

  const std::vector<std::string> _environment;
  std::unique_ptr<Process> _service;
};

}  // namespace varnel
