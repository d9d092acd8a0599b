#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/EventLoopQueue.h"
#include "host/HostApplication.h"
#include "host/SocketPorts.h"
#include "host/TelephonyListener.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/TelephonyServer.h"
#include "tests/support/EventLoop.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::HasSubstr;
using testing::Not;

constexpr std::uint32_t servingCell = 0xB0C1;

// The numbers of antennas that the modems of the SIM cards report: 4 and 2.
Bytes antennasOf(std::uint8_t card) {
  Bytes message = PacketBuilder(servingCell, 22).u8(20, card == 1 ? 4 : 2).bytes();
  message.insert(message.begin(), {0x81, card});
  return message;
}

// Messages of the SIM cards by turns.
class CardsByTurns final : public MessageSource {
 public:
  explicit CardsByTurns(std::vector<std::uint8_t> cards) : _cards(std::move(cards)) {}
  std::optional<StreamMessage> next() override {
    const std::uint8_t card = _cards[_count++ % _cards.size()];
    return StreamMessage{std::chrono::milliseconds(100 * _count), antennasOf(card)};
  }

 private:
  std::vector<std::uint8_t> _cards;
  std::size_t _count = 0;
};

std::chrono::milliseconds sinceStart() {
  return std::chrono::duration_cast<std::chrono::milliseconds>(
      std::chrono::steady_clock::now().time_since_epoch());
}

// A server in this process, and a viewer that ends after two refreshes.
class SimCards : public testing::Test {
 protected:
  std::string shownOf(const std::vector<std::uint8_t>& cards, const std::vector<std::string>& more = {},
                      std::string_view technology = technology::kalviLTE) {
    TelephonyServer server({.ports = _ports,
                            .queue = _queue,
                            .uptime = sinceStart,
                            .technology = std::string(technology),
                            .makeSource = [&] { return std::make_unique<CardsByTurns>(cards); },
                            .messageSent = [](ByteView) {},
                            .tell = [](const std::string&) {}});
    const TelephonyListener listener(
        _runtime.path(), [&](std::string_view viewer) { return server.createLogChannel(viewer); });
    std::vector<std::string> arguments{"--ui", "text", "--runtime-dir", _runtime.path(), "--updates", "2"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    Process viewer(VARNEL_PROGRAM, arguments);
    EXPECT_TRUE(runUntil([&] { return viewer.waitForEnd(0ms); }));
    server.end();
    return viewer.output();
  }

 private:
  int _argumentCount = 1;
  char _name[6] = "tests";
  char* _arguments[2] = {_name, nullptr};
  HostApplication _application{_argumentCount, _arguments};
  TemporaryFolder _runtime;
  SocketPorts _ports{_runtime.path()};
  EventLoopQueue _queue;
};

constexpr const char* notice =
    "Notice: The display mixes what the modems of SIM 1 and SIM 2 send; to see one of them alone, start "
    "varnel with --sim 1\n";

TEST_F(SimCards, ThatAreMixedAreShownAllAndToldOf) { EXPECT_THAT(shownOf({1, 2}), HasSubstr(notice)); }

TEST_F(SimCards, OfWhichOneSendsAreNotToldOf) {
  const std::string shown = shownOf({2});
  EXPECT_THAT(shown, testing::ContainsRegex("Num Tx Antennas +2\n"));
  EXPECT_THAT(shown, Not(HasSubstr("The display mixes")));
}

TEST_F(SimCards, OfAllRadiosStandSideBySide) {
  const std::string shown = shownOf({1, 2}, {}, technology::allRadios);
  EXPECT_THAT(shown, testing::ContainsRegex("SIM 1\n +LTE\n"));
  EXPECT_THAT(shown, testing::ContainsRegex("SIM 2\n +LTE\n"));
  EXPECT_THAT(shown, Not(HasSubstr("The display mixes")));
}

TEST_F(SimCards, OfWhichOneIsChosenAreNotMixed) {
  const std::string shown = shownOf({1, 2}, {"--sim", "1"});
  EXPECT_THAT(shown, testing::ContainsRegex("Num Tx Antennas +4\n"));
  EXPECT_THAT(shown, Not(testing::ContainsRegex("Num Tx Antennas +2\n")));
  EXPECT_THAT(shown, Not(HasSubstr("The display mixes")));
}

}  // namespace
}  // namespace varnel
