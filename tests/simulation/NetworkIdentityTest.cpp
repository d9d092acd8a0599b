#include "programs/varnel-telephonyd/simulation/NetworkIdentity.h"

#include <gtest/gtest.h>

namespace varnel::simulation {
namespace {

class NetworkIdentity : public testing::Test {
 protected:
  NetworkIdentity() {
    _cell.access = Access::UMTS;
    _cell.area = 0x1234;
  }
  // The payload.
  static Bytes behindHeader(const Bytes& packet) { return {packet.begin() + 13, packet.end()}; }
  Bytes serving(Service service) { return behindHeader(servingNetwork(_situation, service)); }
  Bytes equivalent(bool isRegistered) { return behindHeader(equivalentNetworks(_situation, isRegistered)); }

  Cell _cell;
  const Walk _walk{{2000'00, {}}, Random(1)};
  const Situation _situation{std::chrono::seconds(5), _walk, _cell};
};

TEST_F(NetworkIdentity, ANetworkCodeOfTwoDigitsIsFilledUp) {
  EXPECT_EQ(serving(Service::CircuitsAndPackets),
            (Bytes{0, 3, 0x00, 0xF1, 0x10, 0x12, 0x34, 60, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}));
}

TEST_F(NetworkIdentity, ANetworkCodeOfThreeDigitsFillsItAll) {
  _cell.access = Access::GSM;
  _cell.network = partnerNetwork;
  EXPECT_EQ(serving(Service::Limited),
            (Bytes{1, 4, 0x00, 0x01, 0x01, 0x12, 0x34, 60, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}));
}

TEST_F(NetworkIdentity, ThereAreNoEqualsBeforeThePhoneIsRegistered) {
  EXPECT_EQ(equivalent(false), (Bytes{0, 0, 0, 0}));
}

// Six digits from every third place: 0 1 0 0 1 0 are 001 and 100, 0 1 0 0 1 1 are 001 and 101.
TEST_F(NetworkIdentity, TheEqualsOfTheHomeNetworkAreThePartnerAndADistantOne) {
  EXPECT_EQ(equivalent(true), (Bytes{0, 0, 0, 2, 0, 1, 0, 0, 1, 0, 0, 1, 1}));
}

// 0 0 0 0 1 1 are 001 and 001.
TEST_F(NetworkIdentity, TheEqualOfThePartnerIsTheHomeNetwork) {
  _cell.network = partnerNetwork;
  EXPECT_EQ(equivalent(true), (Bytes{0, 0, 0, 1, 0, 0, 0, 0, 1, 1}));
}

}  // namespace
}  // namespace varnel::simulation
