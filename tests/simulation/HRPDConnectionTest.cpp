#include "programs/varnel-telephonyd/simulation/HRPDConnection.h"

#include <gtest/gtest.h>

#include <map>
#include <set>
#include <vector>

namespace varnel::simulation {
namespace {

using namespace std::chrono_literals;
using State = HRPDConnection::State;
using Session = HRPDConnection::Session;
using Radio = HRPDConnection::Radio;
using Moment = std::pair<State, Session>;

Moment momentOf(const HRPDConnection& connection) { return {connection.state(), connection.session()}; }

// Runs the connection until this moment, with the radio for itself.
void runUntil(HRPDConnection& connection, Moment moment, std::chrono::milliseconds& now) {
  while (momentOf(connection) != moment) connection.update(now += 100ms, Radio::Free);
}

TEST(HRPDConnection, ItFindsTheNetworkAndOpensASession) {
  HRPDConnection connection{Random(1)};
  std::vector moments{momentOf(connection)};
  for (auto now = 0ms; now < 1min; now += 100ms) {
    if (connection.update(now, Radio::Free)) moments.push_back(momentOf(connection));
  }
  moments.resize(11);
  EXPECT_EQ(moments, (std::vector<Moment>{{State::Inactive, Session::Closed},
                                          {State::Acquisition, Session::Closed},
                                          {State::Sync, Session::Closed},
                                          {State::Idle, Session::Closed},
                                          {State::Access, Session::AddressSetup},
                                          {State::Connected, Session::NegotiationByPhone},
                                          {State::Connected, Session::NegotiationByNetwork},
                                          {State::Idle, Session::Open},
                                          {State::Access, Session::Open},
                                          {State::Connected, Session::Open},
                                          {State::Idle, Session::Open}}));
}

TEST(HRPDConnection, WithoutTheRadioItLiesStill) {
  HRPDConnection connection{Random(1)};
  for (auto now = 0ms; now < 1min; now += 100ms) EXPECT_FALSE(connection.update(now, Radio::Taken));
  EXPECT_EQ(connection.state(), State::Inactive);
}

TEST(HRPDConnection, AnOpenSessionOutlivesACall) {
  HRPDConnection connection{Random(1)};
  auto now = 0ms;
  runUntil(connection, {State::Connected, Session::Open}, now);
  EXPECT_TRUE(connection.carriesData());
  EXPECT_TRUE(connection.update(now += 100ms, Radio::Taken));
  EXPECT_EQ(momentOf(connection), Moment(State::Inactive, Session::Open));
  EXPECT_FALSE(connection.carriesData());
  EXPECT_FALSE(connection.update(now += 100ms, Radio::Taken));
  EXPECT_TRUE(connection.update(now += 100ms, Radio::Free));
  EXPECT_EQ(momentOf(connection), Moment(State::Acquisition, Session::Open));
}

TEST(HRPDConnection, ASessionThatIsNotOpenYetDoesNot) {
  HRPDConnection connection{Random(1)};
  auto now = 0ms;
  runUntil(connection, {State::Connected, Session::NegotiationByNetwork}, now);
  EXPECT_TRUE(connection.update(now, Radio::Taken));
  EXPECT_EQ(momentOf(connection), Moment(State::Inactive, Session::Closed));
}

TEST(HRPDConnection, StatesTellWhatThePhoneHas) {
  HRPDConnection connection{Random(1)};
  std::set<State> withPilot, sending;
  for (auto now = 0ms; now < 10min; now += 100ms) {
    connection.update(now, Radio::Free);
    if (connection.hasPilot()) withPilot.insert(connection.state());
    if (connection.transmits()) sending.insert(connection.state());
  }
  EXPECT_EQ(withPilot, (std::set{State::Sync, State::Idle, State::Access, State::Connected}));
  EXPECT_EQ(sending, (std::set{State::Access, State::Connected}));
}

}  // namespace
}  // namespace varnel::simulation
