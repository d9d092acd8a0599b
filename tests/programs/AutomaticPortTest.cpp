#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <cstdlib>
#include <memory>
#include <string>
#include <vector>

#include "programs/varnel-telephonyd/sources/ModemManager.h"
#include "tests/support/FakeModemManager.h"
#include "tests/support/PrivateBus.h"
#include "tests/support/Process.h"
#include "tests/support/PtyModem.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

constexpr std::uint32_t textPort = 3, diagnosticPort = 4;

// A server that looks for its port, a modem at a pseudo-terminal, and a service that knows the modem.
class AutomaticPort : public testing::Test {
 protected:
  AutomaticPort() { EXPECT_TRUE(_bus.start()) << "dbus-daemon cannot be started"; }

  void startService(FakeModemManager::Modem modem) {
    _service = std::make_unique<FakeModemManager>(_bus.address(), std::move(modem));
  }
  std::unique_ptr<Process> server(std::vector<std::string> arguments) const {
    arguments.insert(arguments.end(), {"--runtime-dir", _runtime.path()});
    return std::make_unique<Process>(VARNEL_TELEPHONYD_PROGRAM, arguments,
                                     std::vector<std::string>{"DBUS_SYSTEM_BUS_ADDRESS=" + _bus.address()});
  }
  static testing::AssertionResult says(const Process& program, const std::string& part) {
    if (runUntil([&] { return program.error().find(part) != std::string::npos; }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not said: " << part << ", but:\n" << program.error();
  }
  // The modem's port as the service names it, such as "pts/3".
  std::string portName() const { return std::filesystem::canonical(_modem.link()).string().substr(5); }
  std::string device() const { return "/dev/" + portName(); }

  PrivateBus _bus;
  TemporaryFolder _runtime, _folder;
  PtyModem _modem{_folder.file("port")};
  std::unique_ptr<FakeModemManager> _service;
};

TEST_F(AutomaticPort, ModemManagerTellsWhichPortIsTheDiagnosticOne) {
  startService({.ports = {{"no-such-port", textPort}, {portName(), diagnosticPort}}});
  const auto telephony = server({"--port", "auto"});
  EXPECT_TRUE(says(*telephony, device() + " is the diagnostic port of a modem, build TEST.1.0-42\n"));
  EXPECT_TRUE(says(*telephony, "serving all-radios in "));
  EXPECT_THAT(telephony->error(),
              HasSubstr("varnel-telephonyd: ModemManager goes on using this modem; if the two "
                        "disturb each other, type --port auto --inhibit, which cuts the "
                        "modem's data connection while the server runs\n"));
  EXPECT_THAT(_service->inhibitions(), IsEmpty());
}

TEST_F(AutomaticPort, OnRequestModemManagerLeavesTheModemAloneUntilTheServerEnds) {
  startService({.ports = {{portName(), diagnosticPort}}});
  const auto telephony = server({"--port", "auto", "--inhibit"});
  EXPECT_TRUE(says(*telephony, "serving all-radios in "));
  EXPECT_THAT(telephony->error(), HasSubstr("ModemManager leaves the modem of " + device() + " alone until"));
  EXPECT_THAT(telephony->error(), Not(HasSubstr("goes on using")));
  EXPECT_THAT(_service->inhibitions(), ElementsAre("on /sys/devices/usb1/1-2"));
  telephony->signal(SIGTERM);
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 0);
  EXPECT_THAT(_service->inhibitions(), ElementsAre("on /sys/devices/usb1/1-2", "off /sys/devices/usb1/1-2"));
}

TEST_F(AutomaticPort, AModemIsNotLeftAloneAfterAnError) {
  startService({.ports = {{"no-such-port", diagnosticPort}}});
  const auto telephony = server({"--port", "auto", "--inhibit"});
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 1);
  EXPECT_THAT(telephony->error(), HasSubstr("there is no device /dev/no-such-port; "));
  EXPECT_THAT(telephony->error(), HasSubstr("no port of a modem is a diagnostic port that is free; "));
  EXPECT_THAT(_service->inhibitions(), ElementsAre("on /sys/devices/usb1/1-2", "off /sys/devices/usb1/1-2"));
}

TEST_F(AutomaticPort, AModemOfANamedPortCanBeLeftAloneToo) {
  startService({.device = "modem", .ports = {{portName(), textPort}}});
  const auto telephony = server({"--port", _modem.link(), "--inhibit"});
  EXPECT_TRUE(says(*telephony, "serving all-radios in "));
  EXPECT_THAT(_service->inhibitions(), ElementsAre("on modem"));
}

TEST_F(AutomaticPort, WhoMayNotInhibitLearnsWhatToDo) {
  startService({.ports = {{portName(), diagnosticPort}}, .isInhibitionAllowed = false});
  const auto telephony = server({"--port", _modem.link(), "--inhibit"});
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 1);
  EXPECT_EQ(telephony->error(),
            "varnel-telephonyd: ModemManager does not leave the modem alone (not allowed); start "
            "the server with sudo, or allow it to a service with the rule of polkit in varnel-telephonyd(8), "
            "or type sudo systemctl stop ModemManager\n");
}

// The real limit is longer than a test should last.
TEST_F(AutomaticPort, AllCallsTogetherWaitOnlySoLong) {
  startService({.device = "modem", .ports = {{portName(), textPort}}, .answersInhibition = false});
  ::setenv("DBUS_SYSTEM_BUS_ADDRESS", _bus.address().c_str(), 1);
  {
    ModemManager service(std::chrono::seconds(1));
    EXPECT_TRUE(service.ports());
    for (int i = 0; i < 20; ++i)
      EXPECT_THAT(service.inhibit("modem").value_or(""),
                  StartsWith("ModemManager does not leave the modem alone ("));
  }
  EXPECT_TRUE(runUntil([&] { return _service->inhibitions().size() == 40; }));
  EXPECT_EQ(_service->inhibitions().back(), "off modem");
}

TEST_F(AutomaticPort, TheSearchCanBeEnded) {
  _modem.answer = [](ByteView) { return Bytes(); };
  startService({.ports = {{portName(), diagnosticPort}}});
  const auto telephony = server({"--port", "auto", "--inhibit"});
  EXPECT_TRUE(runUntil([&] { return !_service->inhibitions().empty(); }));
  telephony->signal(SIGTERM);
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 0);
  EXPECT_THAT(_service->inhibitions(), ElementsAre("on /sys/devices/usb1/1-2", "off /sys/devices/usb1/1-2"));
}

}  // namespace
}  // namespace varnel
