#include "programs/varnel-telephonyd/simulation/SimulatedModem.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <ostream>
#include <set>
#include <string>
#include <vector>

#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "tests/support/SimulatedMessages.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::AllOf;
using testing::Ge;
using testing::Gt;
using testing::Le;

TEST(SimulatedModems, OnlyWhatIsSimulatedIsMade) {
  EXPECT_THAT(simulatedTechnologies(), testing::ElementsAre("ifx-gsm", "kalvi-gsm-umts", "kalvi-cdma",
                                                            "kalvi-lte", "kalvi-utran-2", "all-radios"));
  EXPECT_EQ(simulatedModem("kalvi-5g", 1), nullptr);
}

// The properties of every modem.
struct Modem {
  std::string technology;
  std::set<unsigned> codes;               // that it sends
  unsigned fewestMessages, mostMessages;  // in five minutes
};

void PrintTo(const Modem& modem, std::ostream* out) { *out << modem.technology; }

class EverySimulatedModem : public testing::TestWithParam<Modem> {
 protected:
  static std::vector<SimulatedPacket> messages(std::uint64_t seed, std::chrono::milliseconds duration) {
    return simulatedMessages(GetParam().technology, seed, duration);
  }
};

TEST_P(EverySimulatedModem, IsMadeByItsName) {
  EXPECT_EQ(simulatedModem(GetParam().technology, 1)->technology(), GetParam().technology);
}

TEST_P(EverySimulatedModem, TheSameSeedGivesTheSameMessages) {
  const auto one = simulatedModem(GetParam().technology, 42),
             other = simulatedModem(GetParam().technology, 42);
  for (int i = 0; i < 2000; ++i) {
    const SimulatedMessage first = one->next(), second = other->next();
    ASSERT_EQ(first.at, second.at) << i;
    ASSERT_EQ(first.bytes, second.bytes) << i;
  }
}

TEST_P(EverySimulatedModem, AnotherSeedGivesOtherMessages) {
  const auto one = messages(1, 1s), other = messages(2, 1s);
  EXPECT_FALSE(std::ranges::equal(one, other, {}, &SimulatedPacket::packet, &SimulatedPacket::packet));
}

TEST_P(EverySimulatedModem, TimeNeverGoesBack) {
  const auto all = messages(3, 10min);
  EXPECT_TRUE(std::ranges::is_sorted(all, {}, &SimulatedPacket::at));
}

TEST_P(EverySimulatedModem, AFewMessagesASecond) {
  const auto count = messages(4, 5min).size();
  EXPECT_THAT(count, AllOf(Ge(GetParam().fewestMessages), Le(GetParam().mostMessages)));
}

TEST_P(EverySimulatedModem, EveryKindOfMessageComesWithinAMinuteAndAgain) {
  for (std::uint64_t seed = 1; seed <= 8; ++seed) {
    std::set<unsigned> first, later;
    for (const SimulatedPacket& message : messages(seed, 4min))
      (message.at <= 1min ? first : later).insert(message.code());
    EXPECT_EQ(first, GetParam().codes) << seed;
    EXPECT_EQ(later, GetParam().codes) << seed;
  }
}

TEST_P(EverySimulatedModem, SomeMessagesHaveThePrefixAndMostHaveNone) {
  const auto all = messages(6, 5min);
  const auto count = std::ranges::count(all, true, &SimulatedPacket::hasPrefix);
  EXPECT_THAT(count, AllOf(Gt(0), Le(std::ssize(all) / 4)));
}

TEST_P(EverySimulatedModem, HeadersSayTypeLengthAndTime) {
  for (const SimulatedPacket& message : messages(7, 1min)) {
    EXPECT_EQ(message.u8(0), message.u16(3) > 2 ? 1u : 0xFFu);
    EXPECT_EQ(message.u16(1), message.packet.size() - 1);
    EXPECT_EQ(message.u32(5), message.at.count());
    EXPECT_EQ(message.u32(9), 0u);
  }
}

INSTANTIATE_TEST_SUITE_P(
    , EverySimulatedModem,
    testing::Values(Modem{"kalvi-gsm-umts",
                          {0x4005, 0x4031, 0x4116, 0x4125, 0x4127,   0x4157,   0x417A,
                           0x4221, 0x5072, 0x5076, 0x512C, 0x5134,   0x5137,   0x51F4,
                           0x51F5, 0x51F6, 0x51F8, 0x51FB, 0x51FD,   0x51FF,   0x7130,
                           0x7131, 0x7132, 0x7135, 0x7150, 0xFF0000, 0xFF0001, 0xFF0002},
                          1200,
                          2400},
                    Modem{"kalvi-lte",
                          {0xB0C1, 0xB0C2, 0xB179, 0xB17F, 0xB180, 0xB186, 0xFF0000, 0xFF0001, 0xFF0002},
                          300,
                          1500},
                    Modem{"kalvi-utran-2",
                          {0xD00A, 0xD00C, 0xD00E, 0xD0E0, 0xD0E2, 0xFF0000, 0xFF0001, 0xFF0002},
                          300,
                          1500}),
    [](const testing::TestParamInfo<Modem>& modem) {
      std::string name = modem.param.technology;
      std::erase(name, '-');
      return name;
    });

}  // namespace
}  // namespace varnel
