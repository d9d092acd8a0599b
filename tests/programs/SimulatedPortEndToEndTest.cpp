#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "tests/support/Process.h"

namespace varnel {
namespace {

using testing::HasSubstr;
using testing::MatchesRegex;
using testing::Not;

// A simulated modem at a pseudo-terminal, a server at that port, and a viewer as text: three processes.
class SimulatedPortEndToEnd : public testing::Test {
 protected:
  static std::unique_ptr<Process> modem(const std::string& technology) {
    return std::make_unique<Process>(VARNEL_TELEPHONYD_PROGRAM,
                                     std::vector<std::string>{"--simulate", technology, "--pty"});
  }
  // The name that the modem prints.
  static std::string deviceOf(const Process& modem) {
    eventually([&] { return modem.output().ends_with('\n'); });
    const std::string output = modem.output();
    return output.substr(0, output.find('\n'));
  }
  std::unique_ptr<Process> server(const std::string& device) const {
    return std::make_unique<Process>(
        VARNEL_TELEPHONYD_PROGRAM,
        std::vector<std::string>{"--port", device, "--runtime-dir", _runtime.path()});
  }
  std::unique_ptr<Process> viewer() const {
    return std::make_unique<Process>(
        VARNEL_PROGRAM, std::vector<std::string>{"--ui", "text", "--runtime-dir", _runtime.path(),
                                                 "--device-root", _folder.path(), "--log-level", "3"});
  }
  static testing::AssertionResult says(const Process& program, const std::string& part) {
    if (eventually([&] { return (program.output() + program.error()).find(part) != std::string::npos; }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not said: " << part << ", but:\n"
                                       << program.output() << program.error();
  }
  static testing::AssertionResult showsMore(const Process& viewer) {
    const std::size_t before = viewer.output().size();
    if (eventually([&] { return viewer.output().size() > before; })) return testing::AssertionSuccess();
    return testing::AssertionFailure() << "nothing new after:\n" << viewer.output() << viewer.error();
  }
  static void end(Process& program) {
    program.signal(SIGTERM);
    ASSERT_TRUE(program.waitForEnd());
    EXPECT_EQ(program.exitStatus(), 0) << program.error();
  }

  TemporaryFolder _runtime, _folder;
};

TEST_F(SimulatedPortEndToEnd, AViewerShowsTheSimulatedModemThroughItsPort) {
  const auto modem = this->modem("all-radios");
  const std::string device = deviceOf(*modem);
  EXPECT_THAT(device, MatchesRegex("/dev/pts/[0-9]+"));
  EXPECT_THAT(modem->error(), HasSubstr("now start varnel-telephonyd --port " + device + "\n"));
  const auto telephony = server(device);
  EXPECT_TRUE(says(*telephony, device + " is the diagnostic port of a modem, build simulated all-radios\n"));
  const auto varnel = viewer();
  EXPECT_TRUE(says(*varnel, "RSRP"));
  end(*telephony);
  EXPECT_THAT(telephony->error(), Not(HasSubstr("answers no more")));
  EXPECT_THAT(telephony->error(), HasSubstr(" records, 0 frames left out\n"));
  end(*modem);
  EXPECT_THAT(modem->error(), MatchesRegex("(.|\n)*: port: [1-9][0-9]* records sent, 0 not taken\n"));
}

TEST_F(SimulatedPortEndToEnd, AnotherServerMayTakeThePortAlsoWhenTheFirstOneWasKilled) {
  const auto modem = this->modem("all-radios");
  const std::string device = deviceOf(*modem);
  auto telephony = server(device);
  const auto varnel = viewer();
  EXPECT_TRUE(says(*varnel, "RSRP"));
  telephony.reset();  // kills it
  telephony = server(device);
  EXPECT_TRUE(says(*telephony, "serving all-radios in "));
  EXPECT_TRUE(showsMore(*varnel));
  end(*telephony);
  telephony = server(device);
  EXPECT_TRUE(says(*telephony, "serving all-radios in "));
  EXPECT_TRUE(showsMore(*varnel));
}

TEST_F(SimulatedPortEndToEnd, AModemThatSendsNoPacketsHasNoPort) {
  const auto modem = this->modem("ifx-gsm");
  ASSERT_TRUE(modem->waitForEnd());
  EXPECT_EQ(modem->exitStatus(), 2);
  EXPECT_EQ(
      modem->error(),
      "varnel-telephonyd: the modem of ifx-gsm sends no log packets, so it has no diagnostic port to play; "
      "see varnel-telephonyd --help\n");
}

}  // namespace
}  // namespace varnel
