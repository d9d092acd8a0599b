#include "programs/varnel-telephonyd/simulation/UTRANConnection.h"

#include <gtest/gtest.h>

#include <set>
#include <vector>

namespace varnel::simulation {
namespace {

using namespace std::chrono_literals;
using State = UTRANConnection::State;
using Area = UTRANConnection::Area;

// The states of one hour in their order, with the first one.
std::vector<State> statesOfAnHour() {
  UTRANConnection connection(Random(1));
  std::vector states{connection.state()};
  for (auto now = 0ms; now < 1h; now += 100ms) {
    if (connection.update(now)) states.push_back(connection.state());
  }
  return states;
}

// A connection at the first moment at which it has this state.
UTRANConnection connectionIn(State state, std::chrono::milliseconds& now) {
  UTRANConnection connection(Random(1));
  while (connection.state() != state) connection.update(now += 100ms);
  return connection;
}

TEST(UTRANConnection, RestGetsDeeperAndDeeper) {
  const auto states = statesOfAnHour();
  const std::vector first(states.begin(), states.begin() + 8);
  EXPECT_EQ(first, (std::vector{State::Disconnected, State::Connecting, State::CellDCH, State::CellFach,
                                State::CellPCH, State::CellFach, State::URAPCH, State::CellFach}));
}

TEST(UTRANConnection, AfterRestItGoesToWorkOrEnds) {
  const auto states = statesOfAnHour();
  std::set<State> afterRest;
  for (std::size_t i = 2; i < states.size(); ++i)
    if (states[i - 2] == State::URAPCH) afterRest.insert(states[i]);
  EXPECT_EQ(afterRest, (std::set{State::CellDCH, State::Disconnected}));
}

TEST(UTRANConnection, ChannelsExistOnDedicatedAndCommonChannelsOnly) {
  std::set<State> withChannels;
  UTRANConnection connection(Random(1));
  for (auto now = 0ms; now < 10min; now += 100ms) {
    connection.update(now);
    if (connection.hasChannels()) withChannels.insert(connection.state());
  }
  EXPECT_EQ(withChannels, (std::set{State::CellDCH, State::CellFach}));
}

TEST(UTRANConnection, APagedCellIsUpdatedWithEveryChange) {
  auto now = 0ms;
  UTRANConnection connection = connectionIn(State::CellPCH, now);
  EXPECT_TRUE(connection.cellChanged(now, Area::Same));
  EXPECT_EQ(connection.state(), State::CellFach);
}

TEST(UTRANConnection, APagedAreaIsUpdatedWhenItIsLeft) {
  auto now = 0ms;
  UTRANConnection connection = connectionIn(State::URAPCH, now);
  EXPECT_FALSE(connection.cellChanged(now, Area::Same));
  EXPECT_EQ(connection.state(), State::URAPCH);
  EXPECT_TRUE(connection.cellChanged(now, Area::Another));
  EXPECT_EQ(connection.state(), State::CellFach);
}

TEST(UTRANConnection, OtherStatesOutliveAChangeOfTheCell) {
  for (const State state : {State::Disconnected, State::Connecting, State::CellDCH, State::CellFach}) {
    auto now = 0ms;
    UTRANConnection connection = connectionIn(state, now);
    EXPECT_FALSE(connection.cellChanged(now, Area::Another));
    EXPECT_EQ(connection.state(), state);
  }
}

}  // namespace
}  // namespace varnel::simulation
