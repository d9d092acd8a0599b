#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>

#include <memory>
#include <string>
#include <vector>

#include "host/CaptureWriter.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

using testing::HasSubstr;
using Texts = std::vector<std::string>;

// A real server that replays a minute, a real viewer, and real commands.
class ControlEndToEnd : public testing::Test {
 protected:
  ControlEndToEnd() {
    CaptureWriter writer(_capture);
    // Of these packets, the viewer of this technology shows the number of antennas (at 20), one more each
    // second, and 0 again.
    for (std::uint8_t second = 0; second <= 60; ++second) {
      Bytes message(22, 0);
      message[0] = 1;
      message[1] = 21;
      message[3] = 0xC1;
      message[4] = 0xB0;
      message[13] = 1;
      message[20] = second % 5;
      writer.write({1'700'000'000 + second, 0}, message);
    }
  }
  std::unique_ptr<Process> server(Texts source) const {
    source.insert(source.end(), {"--runtime-dir", _runtime.path()});
    return std::make_unique<Process>(VARNEL_TELEPHONYD_PROGRAM, source);
  }
  std::unique_ptr<Process> replay() const {
    return server({"--replay", _capture, "--technology", "kalvi-lte"});
  }
  std::unique_ptr<Process> viewer() const {
    return std::make_unique<Process>(VARNEL_PROGRAM,
                                     Texts{"--ui", "text", "--runtime-dir", _runtime.path(), "--device-root",
                                           _device.path(), "--log-level", "3"});
  }
  struct Outcome {
    int status;
    std::string output, error;
  };
  Outcome control(Texts arguments) const {
    arguments.insert(arguments.begin(), {"ctl", "--runtime-dir", _runtime.path()});
    Process process(VARNEL_TELEPHONYD_PROGRAM, arguments);
    EXPECT_TRUE(process.waitForEnd());
    return {process.exitStatus(), process.output(), process.error()};
  }
  void expectDone(const Texts& arguments) const {
    const Outcome outcome = control(arguments);
    EXPECT_EQ(outcome.status, 0) << outcome.error;
    EXPECT_EQ(outcome.output, "");
  }
  // Waits until the status has this part.
  testing::AssertionResult statusHas(const std::string& part) const {
    Outcome outcome{};
    if (eventually([&] {
          outcome = control({"status", "--json"});
          return outcome.output.find(part) != std::string::npos;
        }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not in the status: " << part << "\n"
                                       << outcome.output << outcome.error;
  }
  static testing::AssertionResult logs(const Process& program, const std::string& part, std::size_t times) {
    const auto count = [&] {
      const std::string error = program.error();
      std::size_t found = 0;
      for (auto at = error.find(part); at != std::string::npos; at = error.find(part, at + 1)) ++found;
      return found;
    };
    if (eventually([&] { return count() >= times; })) return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not logged: " << part << "\n" << program.error();
  }

  TemporaryFolder _runtime, _device;
  const std::string _capture = _device.file("minute.pcap");
};

TEST_F(ControlEndToEnd, AReplayIsPausedMovedAndChangedUnderAViewerThatGoesOn) {
  const auto telephony = replay();
  ASSERT_TRUE(statusHas(R"("length":60.000)"));
  const auto varnel = viewer();
  ASSERT_TRUE(statusHas(R"("channels":1)"));
  ASSERT_TRUE(statusHas(R"("delivered":1,)"));
  expectDone({"pause"});
  expectDone({"seek", "0:50"});
  // Everything before the place has been sent, and the stream stands there.
  EXPECT_TRUE(statusHas(R"("position":49.000)"));
  EXPECT_TRUE(statusHas(R"("time":"2023-11-14T22:14:09.000Z")"));
  EXPECT_TRUE(statusHas(R"("paused":true)"));
  expectDone({"seek", "2023-11-14 22:13:30"});
  EXPECT_TRUE(statusHas(R"("position":9.000)"));
  expectDone({"speed", "20"});
  expectDone({"continue"});
  EXPECT_TRUE(statusHas(R"("position":60.000)"));
  EXPECT_TRUE(eventually([&] { return varnel->output().find("has ended") != std::string::npos; }));
  expectDone({"technology", "all-radios"});
  EXPECT_TRUE(logs(*varnel, "***** INVALIDATED", 1));
  EXPECT_TRUE(logs(*varnel, "Starting the display update timer", 2));
  EXPECT_TRUE(statusHas(R"("technology":"all-radios")"));
  EXPECT_TRUE(statusHas(R"("position":60.000)"));
  expectDone({"stop"});
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 0) << telephony->error();
  EXPECT_THAT(telephony->error(), HasSubstr(" 0 dropped, "));
}

TEST_F(ControlEndToEnd, ASimulationChangesItsModem) {
  const auto telephony = server({"--simulate", "kalvi-lte"});
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return varnel->output().find("Serving Cell Info\n") != std::string::npos; }));
  expectDone({"technology", "kalvi-cdma"});
  EXPECT_TRUE(logs(*varnel, "Starting the display update timer", 2));
  EXPECT_TRUE(statusHas(R"("source":"simulation","technology":"kalvi-cdma")"));
  EXPECT_TRUE(statusHas(R"("clients":1,"channels":1)"));
}

TEST_F(ControlEndToEnd, WithoutAServerACommandIsOneLine) {
  std::filesystem::remove(_runtime.path());
  const Outcome outcome = control({"status"});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_FALSE(std::filesystem::exists(_runtime.path()));
  EXPECT_EQ(outcome.error, "varnel-telephonyd ctl: no telephony server serves in " +
                               _runtime.path().string() +
                               "; start varnel-telephonyd, or name its folder with --runtime-dir\n");
}

TEST_F(ControlEndToEnd, MistakesAreOneLineAndStatusTwo) {
  for (const Texts& arguments :
       {Texts{}, Texts{"dance"}, Texts{"speed"}, Texts{"speed", "fast"}, Texts{"seek", "soon"},
        Texts{"technology", "\xFF"}, Texts{"technology", std::string(5000, 'x')}, Texts{"pause", "1"}}) {
    const Outcome outcome = control(arguments);
    EXPECT_EQ(outcome.status, 2) << outcome.error;
    EXPECT_EQ(std::count(outcome.error.begin(), outcome.error.end(), '\n'), 1) << outcome.error;
    EXPECT_THAT(outcome.error, HasSubstr("see varnel-telephonyd ctl --help"));
  }
}

TEST_F(ControlEndToEnd, ARefusalIsOneLineAndStatusOne) {
  const auto telephony = replay();
  ASSERT_TRUE(statusHas(R"("channels":0)"));
  const Outcome outcome = control({"speed", "0"});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.error, "varnel-telephonyd ctl: the speed must lie between 0.001 and 1000000\n");
}

}  // namespace
}  // namespace varnel
