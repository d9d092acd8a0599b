#include "programs/varnel-telephonyd/simulation/GSMConnection.h"

#include <gtest/gtest.h>

#include <vector>

namespace varnel::simulation {
namespace {

using namespace std::chrono_literals;
using State = GSMConnection::State;
using Traffic = GSMConnection::Traffic;

// A connection at the first moment at which it has this state.
GSMConnection connectionIn(State state, std::chrono::milliseconds& now) {
  GSMConnection connection(Random(1));
  connection.arrive(now);
  while (connection.state() != state) connection.update(now += 100ms);
  return connection;
}

TEST(GSMConnection, IsInactiveUntilThePhoneArrives) {
  GSMConnection connection(Random(1));
  EXPECT_FALSE(connection.update(1h));
  EXPECT_EQ(connection.state(), State::Inactive);
}

TEST(GSMConnection, SpeaksAndTransfersDataByTurns) {
  GSMConnection connection(Random(1));
  connection.arrive(0ms);
  std::vector states{connection.state()};
  std::vector<Traffic> traffic;
  for (auto now = 0ms; now < 2min && states.size() < 10; now += 100ms) {
    if (!connection.update(now)) continue;
    states.push_back(connection.state());
    if (connection.state() == State::Transfer) traffic.push_back(connection.traffic());
  }
  EXPECT_EQ(states,
            (std::vector{State::FromUMTS, State::Idle, State::Pending, State::Transfer, State::Release,
                         State::Idle, State::Pending, State::Transfer, State::Release, State::Idle}));
  EXPECT_EQ(traffic, (std::vector{Traffic::Voice, Traffic::Data}));
}

TEST(GSMConnection, AFirstCallBeginsWithinSevenSeconds) {
  for (std::uint64_t seed = 1; seed <= 50; ++seed) {
    GSMConnection connection{Random(seed)};
    connection.arrive(0ms);
    auto now = 0ms;
    while (!connection.isSpeaking() && now < 1min) connection.update(now += 100ms);
    EXPECT_LE(now, 7s) << seed;
  }
}

TEST(GSMConnection, AnIdlePhoneReselectsAndOthersAreHandedOver) {
  for (const State state : {State::FromUMTS, State::Idle, State::Pending, State::Transfer, State::Release}) {
    auto now = 0ms;
    GSMConnection connection = connectionIn(state, now);
    EXPECT_EQ(connection.cellChanged(now), state == State::Idle);
    EXPECT_EQ(connection.state(), state == State::Idle ? State::CellReselection : state);
  }
}

TEST(GSMConnection, LeavingEndsInactive) {
  auto now = 0ms;
  GSMConnection connection = connectionIn(State::Idle, now);
  connection.leave(now);
  EXPECT_EQ(connection.state(), State::ToUMTS);
  EXPECT_TRUE(connection.update(now + 1s));
  EXPECT_EQ(connection.state(), State::Inactive);
}

}  // namespace
}  // namespace varnel::simulation
