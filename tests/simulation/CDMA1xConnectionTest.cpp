#include "programs/varnel-telephonyd/simulation/CDMA1xConnection.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>
#include <vector>

namespace varnel::simulation {
namespace {

using namespace std::chrono_literals;
using State = CDMA1xConnection::State;

// The states of one hour in their order, with the first one.
std::vector<State> statesOfAnHour(std::uint64_t seed = 1) {
  CDMA1xConnection connection{Random(seed)};
  std::vector states{connection.state()};
  for (auto now = 0ms; now < 1h; now += 100ms) {
    if (connection.update(now)) states.push_back(connection.state());
  }
  return states;
}

TEST(CDMA1xConnection, ItFindsTheNetworkStepByStep) {
  const auto states = statesOfAnHour();
  const std::vector first(states.begin(), states.begin() + 8);
  EXPECT_EQ(first, (std::vector{State::Powerup, State::Initial, State::Acquisition, State::Sync, State::Slew,
                                State::Paging, State::SlottedSleep, State::Paging}));
}

TEST(CDMA1xConnection, StatesFollowOneAnotherAsInANetwork) {
  const std::map<State, std::set<State>> allowed = {
      {State::Powerup, {State::Initial}},     {State::Initial, {State::Acquisition}},
      {State::Acquisition, {State::Sync}},    {State::Sync, {State::Slew}},
      {State::Slew, {State::Paging}},         {State::Paging, {State::SlottedSleep, State::Traffic}},
      {State::SlottedSleep, {State::Paging}}, {State::Traffic, {State::Acquisition}},
  };
  for (const std::uint64_t seed : {1, 2, 3}) {
    const auto states = statesOfAnHour(seed);
    for (std::size_t i = 1; i < states.size(); ++i)
      EXPECT_TRUE(allowed.at(states[i - 1]).contains(states[i])) << seed << " at " << i;
  }
}

TEST(CDMA1xConnection, CallsComeAfterAFewPages) {
  const auto states = statesOfAnHour();
  EXPECT_GE(std::ranges::count(states, State::Traffic), 40);
  // Between two calls there are from five to nine pages.
  int pages = 0;
  std::set<int> counts;
  for (const State state : states) {
    if (state == State::Paging) ++pages;
    if (state == State::Traffic) counts.insert(std::exchange(pages, 0));
  }
  EXPECT_EQ(*counts.begin(), 5);
  EXPECT_EQ(*counts.rbegin(), 9);
}

TEST(CDMA1xConnection, APilotIsThereOnceItWasFound) {
  std::set<State> withPilot, idle;
  CDMA1xConnection connection{Random(1)};
  for (auto now = 0ms; now < 10min; now += 100ms) {
    connection.update(now);
    if (connection.hasPilot()) withPilot.insert(connection.state());
    if (connection.isIdle()) idle.insert(connection.state());
  }
  EXPECT_EQ(withPilot,
            (std::set{State::Sync, State::Slew, State::Paging, State::SlottedSleep, State::Traffic}));
  EXPECT_EQ(idle, (std::set{State::Paging, State::SlottedSleep}));
}

}  // namespace
}  // namespace varnel::simulation
