#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <iterator>
#include <memory>
#include <string>
#include <vector>

#include "tests/support/MockModemManager.h"
#include "tests/support/PrivateBus.h"
#include "tests/support/Process.h"
#include "tests/support/RealModemManager.h"

// A server that shows what ModemManager tells, and a viewer's text.

namespace varnel {
namespace {

using testing::HasSubstr;
using testing::Not;

class LiveEndToEnd : public testing::Test {
 protected:
  LiveEndToEnd() { EXPECT_TRUE(_bus.start()) << "dbus-daemon cannot be started"; }

  void startServer(std::vector<std::string> arguments) {
    arguments.insert(arguments.end(), {"--runtime-dir", _runtime.path()});
    _server =
        std::make_unique<Process>(VARNEL_TELEPHONYD_PROGRAM, arguments,
                                  std::vector<std::string>{"DBUS_SYSTEM_BUS_ADDRESS=" + _bus.address()});
    EXPECT_TRUE(eventually([&] {
      return _server->error().find("serving all-radios in ") != std::string::npos;
    })) << _server->error();
  }
  void startViewer() {
    _viewer = std::make_unique<Process>(
        VARNEL_PROGRAM, std::vector<std::string>{"--ui", "text", "--runtime-dir", _runtime.path()});
  }
  testing::AssertionResult shows(const std::string& part) const {
    if (eventually([&] { return page().find(part) != std::string::npos; }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "no " << part << " in\n" << page() << _server->error();
  }
  testing::AssertionResult says(const std::string& part) const {
    if (eventually([&] { return _server->error().find(part) != std::string::npos; }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not said: " << part << ", but:\n" << _server->error();
  }
  std::string status() const {
    Process program(VARNEL_TELEPHONYD_PROGRAM, {"ctl", "--runtime-dir", _runtime.path(), "status"});
    EXPECT_TRUE(program.waitForEnd());
    return program.output();
  }

  PrivateBus _bus;
  TemporaryFolder _runtime;
  std::unique_ptr<Process> _server, _viewer;

 private:
  // The last page, which may not be whole yet.
  std::string page() const {
    const std::string text = _viewer->output();
    const std::size_t begin = text.rfind("\nUpdated ");
    return begin == std::string::npos ? text : text.substr(begin);
  }
};

TEST_F(LiveEndToEnd, EveryValueIsInItsRow) {
  MockModemManager service(_bus.address());
  service.start();
  service.does({"card",
                "8949000000000000001",
                "then",
                "bearer",
                "4",
                "then",
                "add",
                "0",
                "8",
                "/sys/a",
                "14,15",
                "then",
                "cells",
                "0",
                "lte",
                "lte-neighbor",
                "nr",
                "umts",
                "umts-neighbor",
                "gsm",
                "gsm-neighbor"});
  startServer({"--live", "--poll", "1"});
  startViewer();
  ASSERT_TRUE(shows("\nModem\n"));
  EXPECT_TRUE(
      shows("  Registration\n"
            "    State              Home\n"
            "    Operator           Test Net\n"
            "    PLMN               262-01\n"
            "    Access Technology  LTE, 5GNR\n"
            "    Signal Quality     71%\n"));
  EXPECT_TRUE(
      shows("  LTE Cell\n"
            "    PLMN                262-01\n"
            "    Tracking Area Code  24090\n"
            "    Cell Identity       30585796\n"
            "    eNB                 119475\n"
            "    Cell                196\n"
            "    EARFCN              66986\n"
            "    Band                66\n"
            "    Downlink Frequency  2165.0 MHz\n"));
  EXPECT_TRUE(shows("    RSRP                -95.50 dBm\n    RSRQ                -10.50 dB\n"));
  EXPECT_TRUE(
      shows("  NR Cell\n"
            "    PLMN                262-01\n"
            "    Tracking Area Code  11259375\n"
            "    Cell Identity       65016260489\n"
            "    NR-ARFCN            632628\n"));
  EXPECT_TRUE(shows("    SINR                17.5 dB\n"));
  EXPECT_TRUE(
      shows("    UARFCN              10562\n"
            "    Band                1\n"
            "    Downlink Frequency  2112.4 MHz\n"
            "    Scrambling Code     511\n"
            "    RSCP                -81.00 dBm\n"
            "    EcIo                -7.50 dB\n"));
  EXPECT_TRUE(
      shows("    ARFCN               62\n"
            "    BSIC                47\n"
            "    Timing Advance      3\n"
            "    RSSI                -70.00 dBm\n"));
  // The sections that the cell monitor fills.
  EXPECT_TRUE(shows("\nLTE\n  Serving Cell\n    Physical Cell ID     426\n    EARFCN               66986\n"));
  EXPECT_TRUE(shows("        EARFCN              6300\n        Physical Cell ID    11\n"));
  EXPECT_TRUE(shows("      APN             internet.example\n"));
  EXPECT_TRUE(shows("      Bytes Received  5000000000\n"));
  EXPECT_TRUE(shows("    EF-ICCID                         present\n"));
  EXPECT_THAT(status(), HasSubstr("source      ModemManager\n"
                                  "modem       Maker M1 is registered in Test Net\n"
                                  "technology  all-radios\n"));
  service.does({"change", "0", "Signal", "Lte={'rsrp': -70.0}"});
  EXPECT_TRUE(shows("    RSRP                -70.00 dBm\n"));
  service.does({"remove", "0"});
  EXPECT_TRUE(says("varnel-telephonyd: Maker M1 has gone; plug it in again\n"));
  EXPECT_TRUE(shows("    Operator\n"));
  _server->signal(SIGTERM);
  ASSERT_TRUE(_server->waitForEnd());
  EXPECT_EQ(_server->exitStatus(), 0);
}

// As when its terminal is closed.
TEST_F(LiveEndToEnd, AHangUpEndsTheServerInOrder) {
  MockModemManager service(_bus.address());
  service.start();
  service.does({"add", "0"});
  startServer({"--live", "--poll", "1"});
  startViewer();
  ASSERT_TRUE(shows("    Operator           Test Net\n"));
  ASSERT_TRUE(eventually([&] { return service.calls().find(" Setup 1\n") != std::string::npos; }));
  _server->signal(SIGHUP);
  ASSERT_TRUE(_server->waitForEnd());
  EXPECT_EQ(_server->exitStatus(), 0) << _server->error();
  EXPECT_THAT(service.calls(), HasSubstr(" Setup 0\n"));
}

TEST_F(LiveEndToEnd, WithoutAnOptionTheServerTakesModemManagerWhenThereIsNoPort) {
  MockModemManager service(_bus.address());
  service.start();
  startServer({});
  EXPECT_THAT(_server->error(),
              HasSubstr("varnel-telephonyd: no diagnostic port can be used (ModemManager knows no diagnostic "
                        "port, and udev marks no port as a modem's), so the server shows what ModemManager "
                        "tells\n"));
  EXPECT_TRUE(says("ModemManager knows no modem; plug one in\n"));
  EXPECT_THAT(status(), HasSubstr("modem       ModemManager knows no modem; plug one in\n"));
}

TEST_F(LiveEndToEnd, PositionsAreRecordedOnlyOnRequest) {
  MockModemManager service(_bus.address());
  service.start();
  service.does({"add", "0", "then", "location", "0",
                "{dbus.UInt32(2): dbus.Dictionary({'utc-time': '1', 'latitude': 52.5, 'longitude': -13.25, "
                "'altitude': 34.0}, signature='sv')}"});
  const std::string capture = _runtime.file("walk.pcapng");
  for (const bool isAsked : {false, true}) {
    std::vector<std::string> arguments{"--live", "--record", capture, "--overwrite"};
    if (isAsked) arguments.emplace_back("--record-position");
    startServer(arguments);
    startViewer();
    ASSERT_TRUE(shows(isAsked ? "    Latitude   present" : "    Operator           Test Net\n"));
    _server->signal(SIGTERM);
    ASSERT_TRUE(_server->waitForEnd());
    const std::string contents = contentsOf(capture);
    EXPECT_THAT(contents, HasSubstr("Operator"));
    if (isAsked)
      EXPECT_THAT(contents, HasSubstr("Latitude"));
    else
      EXPECT_THAT(contents, Not(HasSubstr("Latitude")));
  }
}

// The life of a modem, as the real service has it.
TEST_F(LiveEndToEnd, TheRealServiceAndItsModemComeAndGo) {
  startServer({"--live", "--poll", "1"});
  EXPECT_TRUE(says("ModemManager does not run; type sudo systemctl start ModemManager\n"));
  RealModemManager service(_bus.address());
  service.start();
  EXPECT_TRUE(says("ModemManager knows no modem; plug one in\n"));
  startViewer();
  service.plugIn();
  EXPECT_TRUE(says("Maker M1 is disabled; type mmcli -m 0 --enable\n"));
  service.enable();
  EXPECT_TRUE(says("Maker M1 is registered in 00101\n"));
  EXPECT_TRUE(
      shows("    PLMN                001-01\n"
            "    Tracking Area Code  2587\n"
            "    Cell Identity       29545444\n"));
  // 3GPP TS 27.007, 8.69: 50 stands for -91 dBm at most, and 20 for -10 dB.
  EXPECT_TRUE(shows("    RSRP                -91.00 dBm\n    RSRQ                -10.00 dB\n"));
  EXPECT_TRUE(shows("    EF-MSISDN                        present\n"));
  service.stop();
  EXPECT_TRUE(shows("    RSRP\n    RSRQ\n"));
  EXPECT_THAT(status(), HasSubstr("modem       ModemManager does not run; "));
  service.start();
  service.plugIn();
  service.enable();
  EXPECT_TRUE(shows("    RSRP                -91.00 dBm\n    RSRQ                -10.00 dB\n"));
  _server->signal(SIGTERM);
  ASSERT_TRUE(_server->waitForEnd());
  EXPECT_EQ(_server->exitStatus(), 0);
  EXPECT_TRUE(eventually([&] { return service.run("/usr/bin/mmcli", {"-m", "any", "--signal-get"}); }));
}

TEST_F(LiveEndToEnd, TheBusTakesTheExampleOfAPolicy) {
  _bus.stop();
  EXPECT_TRUE(_bus.start("<include>" VARNEL_SOURCE_DIR "/packaging/dbus/varnel-modemmanager.conf</include>"));
  PrivateBus other;
  EXPECT_FALSE(other.start("<include>" VARNEL_SOURCE_DIR "/README.md</include>"));
}

std::size_t openFilesOf(const Process& process) {
  const std::filesystem::directory_iterator files("/proc/" + std::to_string(process.id()) + "/fd");
  return static_cast<std::size_t>(std::distance(begin(files), end(files)));
}

// Resident memory in kB.
std::size_t memoryOf(const Process& process) {
  const std::string status = contentsOf("/proc/" + std::to_string(process.id()) + "/status");
  return std::stoul(status.substr(status.find("VmRSS:") + 6));
}

// A sanitizer keeps freed memory back. It looks for leaks itself when the program ends.
#ifdef __SANITIZE_ADDRESS__
constexpr bool isMemoryReused = false;
#else
constexpr bool isMemoryReused = true;
#endif

// ./dev soak live makes more rounds.
TEST_F(LiveEndToEnd, TheRealServiceAndItsModemAreAlwaysBack) {
  const char* const wish = std::getenv("VARNEL_SOAK_ROUNDS");
  const int rounds = wish ? std::stoi(wish) : 50;
  RealModemManager service(_bus.address());
  service.start();
  startServer({"--live", "--poll", "1"});
  startViewer();
  std::size_t files = 0, memory = 0;
  for (int round = 1; round <= rounds; ++round) {
    service.plugIn();
    service.enable();
    ASSERT_TRUE(shows("    RSRP                -91.00 dBm\n")) << "round " << round;
    if (round == rounds / 5 + 1) files = openFilesOf(*_server), memory = memoryOf(*_server);
    if (round % 2 == 0) {
      service.stop();
      ASSERT_TRUE(shows("    RSRP\n")) << "round " << round;
      service.start();
    } else {
      service.unplug();
      ASSERT_TRUE(shows("    RSRP\n")) << "round " << round;
    }
  }
  service.plugIn();
  service.enable();
  EXPECT_TRUE(shows("    RSRP                -91.00 dBm\n"));
  EXPECT_LE(openFilesOf(*_server), files + 2);
  constexpr std::size_t noise = 1024;
  if (isMemoryReused) {
    EXPECT_LE(memoryOf(*_server), memory + noise);
  }
  std::printf("%d rounds: %zu open files, memory %zu kB, then %zu kB\n", rounds, openFilesOf(*_server),
              memory, memoryOf(*_server));
  _server->signal(SIGTERM);
  ASSERT_TRUE(_server->waitForEnd());
  EXPECT_EQ(_server->exitStatus(), 0) << _server->error();
}

}  // namespace
}  // namespace varnel
