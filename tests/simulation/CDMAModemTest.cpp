#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <map>
#include <optional>
#include <set>
#include <vector>

#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "tests/support/DistinctValues.h"
#include "tests/support/SimulatedMessages.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::AllOf;
using testing::AnyOf;
using testing::Ge;
using testing::Gt;
using testing::IsSupersetOf;
using testing::Le;
using testing::UnorderedElementsAre;

using Message = SimulatedPacket;

constexpr unsigned paging = 6, sleeping = 7, traffic = 8;
constexpr unsigned inactive = 0, acquisition = 1, access = 4, connected = 5, sessionOpen = 4;
constexpr unsigned noPilot = 0xFFFF;

std::vector<Message> messages(std::uint64_t seed, std::chrono::milliseconds duration) {
  return simulatedMessages("kalvi-cdma", seed, duration);
}

std::vector<Message> messagesOf(unsigned code, std::chrono::milliseconds duration, std::uint64_t seed = 1) {
  return simulatedMessagesOf(code, "kalvi-cdma", seed, duration);
}

int i8(const Message& message, std::size_t offset) { return static_cast<std::int8_t>(message.u8(offset)); }

// A report of 1x in 0x119C: the places of its subpackets, and the strengths of its pilots.
struct VoiceStatus {
  explicit VoiceStatus(const Message& message) {
    std::size_t start = 17;
    for (unsigned left = message.u8(14); left > 0; --left) {
      subpackets[message.u8(start)] = start;
      start += message.u16(start + 2);
    }
    end = start;
    state = message.u8(subpackets.at(1) + 4);
    const std::size_t set = subpackets.at(3);
    const double chips = message.u16(set + 4), gain = message.u8(set + 6);
    const unsigned exponent = message.u8(set + 7), extensions = message.u8(set + 9);
    reference = message.u16(set + 10);
    for (unsigned i = 0; i < message.u8(set + 8); ++i) {
      const std::size_t stride = i * ((6 * extensions + 15) & 0xFFC);
      const double energy = message.u16(set + 24 + 4 * extensions + stride);
      const double strength =
          std::pow(2.0, 2.0 * exponent - 3) * energy / (9 * chips * chips * gain) - 1 / chips;
      strengths_db[message.u16(set + 12 + stride)] = 10 * std::log10(std::max(strength, 0.00001));
    }
  }

  std::map<unsigned, std::size_t> subpackets;
  std::size_t end = 0;
  unsigned state = 0, reference = 0;
  std::map<unsigned, double> strengths_db;
};

TEST(CDMAModem, TheSameSeedGivesTheSameMessages) {
  const auto one = simulatedModem("kalvi-cdma", 42), other = simulatedModem("kalvi-cdma", 42);
  for (int i = 0; i < 4000; ++i) {
    const SimulatedMessage first = one->next(), second = other->next();
    ASSERT_EQ(first.at, second.at) << i;
    ASSERT_EQ(first.bytes, second.bytes) << i;
  }
}

TEST(CDMAModem, AnotherSeedGivesOtherMessages) {
  EXPECT_NE(messagesOf(0x134F, 10s, 1).at(0).packet, messagesOf(0x134F, 10s, 2).at(0).packet);
}

TEST(CDMAModem, TheMessagesAreTheSameOnEveryMachine) {
  const Message first = messagesOf(0x119C, 1s).at(0);
  EXPECT_EQ(first.packet, (Bytes{0x01, 0x3C, 0x00, 0x9C, 0x11, 0x14, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00,
                                 0x01, 0x04, 0x00, 0x00, 0x01, 0x00, 0x08, 0x00, 0x0B, 0x00, 0x00, 0x00, 0x02,
                                 0x00, 0x10, 0x00, 0x00, 0x00, 0x1B, 0x01, 0x1B, 0x01, 0xF2, 0xF0, 0xD8, 0xFF,
                                 0x00, 0x00, 0x03, 0x00, 0x0C, 0x00, 0x00, 0x02, 0x04, 0x05, 0x00, 0x02, 0xD8,
                                 0x00, 0x04, 0x00, 0x08, 0x00, 0x00, 0x00, 0x00, 0x00}));
}

TEST(CDMAModem, TimeNeverGoesBack) {
  EXPECT_TRUE(std::ranges::is_sorted(messages(3, 10min), {}, &Message::at));
}

TEST(CDMAModem, EveryKindOfMessageComesWithinAMinute) {
  for (std::uint64_t seed = 1; seed <= 40; ++seed) {
    std::set<unsigned> codes;
    for (const Message& message : messages(seed, 1min)) codes.insert(message.code());
    EXPECT_THAT(codes,
                UnorderedElementsAre(0x108Au, 0x1183u, 0x1192u, 0x119Cu, 0x119Du, 0x127Eu, 0x12B6u, 0x134Fu))
        << seed;
  }
}

TEST(CDMAModem, BothHalvesAreSeenAtWorkWithinAMinute) {
  for (std::uint64_t seed = 1; seed <= 40; ++seed) {
    std::set<unsigned> voice, data, sessions;
    for (const Message& message : messages(seed, 1min)) {
      if (message.code() == 0x119C) voice.insert(VoiceStatus(message).state);
      if (message.code() != 0x1183) continue;
      data.insert(message.u8(36));
      sessions.insert(message.u8(37));
    }
    EXPECT_THAT(voice, UnorderedElementsAre(2u, 3u, 4u, 5u, 6u, 7u, 8u, 11u)) << seed;
    EXPECT_THAT(data, UnorderedElementsAre(0u, 1u, 2u, 3u, 4u, 5u)) << seed;
    EXPECT_THAT(sessions, UnorderedElementsAre(0u, 1u, 2u, 3u, 4u)) << seed;
  }
}

TEST(CDMAModem, HeadersSayTypeLengthAndTime) {
  for (const Message& message : messages(7, 1min)) {
    EXPECT_EQ(message.u8(0), 1u);
    EXPECT_EQ(message.u16(1), message.packet.size() - 1);
    EXPECT_EQ(message.u32(5), message.at.count());
    EXPECT_EQ(message.u32(9), 0u);
  }
}

TEST(CDMAModem, VoiceStatesFollowOneAnotherAsInANetwork) {
  const std::map<unsigned, std::set<unsigned>> allowed = {
      {11, {2}},
      {2, {3}},
      {3, {4}},
      {4, {5}},
      {5, {paging}},
      {paging, {sleeping, traffic}},
      {sleeping, {paging}},
      {traffic, {3}},
  };
  for (const std::uint64_t seed : {1, 2, 3}) {
    unsigned state = 11;
    for (const Message& message : messagesOf(0x119C, 5min, seed)) {
      const unsigned next = VoiceStatus(message).state;
      EXPECT_TRUE(next == state || allowed.at(state).contains(next)) << state << " to " << next;
      state = next;
    }
  }
}

TEST(CDMAModem, DataStatesFollowOneAnotherAsInANetwork) {
  // A call may end any state.
  const std::map<unsigned, std::set<unsigned>> allowed = {
      {inactive, {acquisition}}, {acquisition, {2, inactive}},    {2, {3, inactive}},
      {3, {access, inactive}},   {access, {connected, inactive}}, {connected, {3, inactive}},
  };
  for (const std::uint64_t seed : {1, 2, 3}) {
    unsigned state = inactive, session = 0;
    for (const Message& message : messagesOf(0x1183, 5min, seed)) {
      const unsigned next = message.u8(36), nextSession = message.u8(37);
      EXPECT_TRUE(next == state || allowed.at(state).contains(next)) << state << " to " << next;
      EXPECT_TRUE(nextSession == session || nextSession == session + 1 ||
                  (nextSession == 0 && session < sessionOpen))
          << session << " to " << nextSession;
      state = next;
      session = nextSession;
    }
    EXPECT_EQ(session, sessionOpen);
  }
}

TEST(CDMAModem, ACallTakesTheRadioForItself) {
  unsigned voice = 11;
  std::chrono::milliseconds since{0};
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x119C && VoiceStatus(message).state != voice) {
      voice = VoiceStatus(message).state;
      since = message.at;
    }
    if (message.code() == 0x119D) {
      EXPECT_EQ(voice, traffic);
    }
    const bool isIdle = voice == paging || voice == sleeping;
    if (message.code() == 0x1183 && !isIdle && message.at > since) {
      EXPECT_EQ(message.u8(36), inactive);
    }
  }
}

bool isWithoutPilot(const VoiceStatus& status) {
  return status.state == 11 || status.state == 2 || status.state == 3;
}

// The statuses of 1x within 20 minutes.
std::vector<VoiceStatus> voiceStatuses() {
  std::vector<VoiceStatus> statuses;
  for (const Message& message : messagesOf(0x119C, 20min)) statuses.emplace_back(message);
  return statuses;
}

TEST(CDMAModem, VoiceStatusesHaveFourSubpackets) {
  for (const Message& message : messagesOf(0x119C, 20min)) {
    const VoiceStatus status(message);
    EXPECT_EQ(status.end, message.packet.size());
    EXPECT_EQ(status.subpackets.size(), 4u);
  }
}

TEST(CDMAModem, RadiosOfVoiceAreBelievable) {
  std::set<int> gains;
  for (const Message& message : messagesOf(0x119C, 20min)) {
    const std::size_t radio = VoiceStatus(message).subpackets.at(2);
    EXPECT_EQ(message.u8(radio + 4), 0u);
    EXPECT_EQ(message.u8(radio + 5), 0u);
    EXPECT_EQ(message.u16(radio + 8), message.u16(radio + 6));
    // From -103 to -45 dBm.
    for (const std::size_t chain : {10, 11}) EXPECT_THAT(i8(message, radio + chain), AllOf(Ge(-119), Le(54)));
    const int power = static_cast<std::int16_t>(message.u16(radio + 12));
    EXPECT_THAT(power, AllOf(Ge(-500), Le(230)));
    gains.insert(i8(message, radio + 10));
  }
  EXPECT_GE(gains.size(), 30u);
}

TEST(CDMAModem, CallsMayBeOnASecondChannel) {
  std::set<unsigned> channels;
  for (const Message& message : messagesOf(0x119C, 20min)) {
    const VoiceStatus status(message);
    const unsigned channel = message.u16(status.subpackets.at(2) + 6);
    EXPECT_TRUE(status.state == traffic || channel == 283);
    channels.insert(channel);
  }
  EXPECT_THAT(channels, UnorderedElementsAre(283u, 242u));
}

TEST(CDMAModem, PilotsOfVoiceAreBelievable) {
  for (const VoiceStatus& status : voiceStatuses()) {
    for (const auto& [pilot, strength_db] : status.strengths_db) {
      EXPECT_LE(pilot, 511u);
      // At most a fifth of the power.
      EXPECT_THAT(strength_db, AllOf(Ge(-25.0), Le(-6.9)));
    }
  }
}

TEST(CDMAModem, SeveralPilotsAreActiveInACallOnly) {
  const auto statuses = voiceStatuses();
  for (const VoiceStatus& status : statuses) {
    EXPECT_EQ(status.strengths_db.empty(), isWithoutPilot(status));
    if (status.state != traffic) {
      EXPECT_LE(status.strengths_db.size(), 1u);
    }
  }
  const auto counts = distinctValues(statuses, [](const VoiceStatus& s) { return s.strengths_db.size(); });
  EXPECT_THAT(counts, IsSupersetOf({0u, 1u, 2u}));
}

TEST(CDMAModem, TheReferenceIsOneOfThePilotsAndChanges) {
  const auto statuses = voiceStatuses();
  for (const VoiceStatus& status : statuses)
    EXPECT_TRUE(isWithoutPilot(status) || status.strengths_db.contains(status.reference));
  EXPECT_GE(distinctValues(statuses, &VoiceStatus::reference).size(), 4u);
}

TEST(CDMAModem, OneFrameOfAHundredIsErasedAndMoreWhereTheActiveSetIsWeak) {
  std::map<bool, std::pair<int, int>> erasedOfAll;  // the key says whether the active set is weak
  bool isWeak = false;
  std::optional<std::chrono::milliseconds> last;
  for (const Message& message : messages(1, 120min)) {
    if (message.code() == 0x119C) {
      double strength = 0;
      for (const auto& [pilot, strength_db] : VoiceStatus(message).strengths_db)
        strength += std::pow(10.0, strength_db / 10);
      isWeak = strength < 0.151;  // -8.2 dB
    }
    if (message.code() != 0x119D) continue;
    ASSERT_EQ(message.packet.size(), 45u);
    EXPECT_EQ(message.u8(14), 1u);
    EXPECT_EQ(message.u8(17), 11u);
    EXPECT_LE(message.u8(41), 1u);
    auto& [erased, all] = erasedOfAll[isWeak];
    erased += static_cast<int>(message.u8(41));
    ++all;
    // One every 20 ms of a call.
    if (last && message.at - *last < 1s) {
      EXPECT_EQ(message.at - *last, 20ms);
    }
    last = message.at;
  }
  const auto rate = [&erasedOfAll](bool weak) {
    return static_cast<double>(erasedOfAll[weak].first) / erasedOfAll[weak].second;
  };
  EXPECT_GT(erasedOfAll[false].second, 50'000);
  EXPECT_GT(erasedOfAll[true].second, 500);
  EXPECT_THAT(rate(false), AllOf(Ge(0.007), Le(0.02)));
  EXPECT_THAT(rate(true), AllOf(Gt(0.025), Le(0.3)));
}

unsigned dataAddress(const Message& message) { return message.u16(38) | message.u8(40) << 16; }

TEST(CDMAModem, DataStatusesAreBelievable) {
  for (const Message& message : messagesOf(0x1183, 30min)) {
    ASSERT_EQ(message.packet.size(), 50u);
    EXPECT_EQ(message.u8(14) >> 3, 0u);
    const int level_dbm = i8(message, 15);
    EXPECT_THAT(level_dbm, AllOf(Ge(-106), Le(-45)));
    EXPECT_THAT(i8(message, 16), AllOf(Ge(-106), Le(level_dbm + 4)));
  }
}

TEST(CDMAModem, DataMayBeOnASecondChannelWhileConnected) {
  std::set<unsigned> channels;
  for (const Message& message : messagesOf(0x1183, 30min)) {
    const unsigned channel = message.u16(13) & 0x7FF;
    EXPECT_TRUE(channel == 78 || (message.u8(36) == connected && message.u8(37) == sessionOpen));
    channels.insert(channel);
  }
  EXPECT_THAT(channels, UnorderedElementsAre(78u, 37u));
}

TEST(CDMAModem, ThePhoneSendsDataFromTheAccessOn) {
  for (const Message& message : messagesOf(0x1183, 30min)) {
    const int level_dbm = i8(message, 15), power_dbm = i8(message, 17);
    if (message.u8(36) < access) {
      EXPECT_EQ(power_dbm, -50);
    } else {
      EXPECT_NEAR(power_dbm, std::min(-73 - level_dbm, 23), 6);
    }
  }
}

TEST(CDMAModem, DataHaveAServingPilotOnceOneIsAcquired) {
  std::set<unsigned> pilots;
  for (const Message& message : messagesOf(0x1183, 30min)) {
    const unsigned state = message.u8(36), pilot = message.u16(18);
    EXPECT_EQ(pilot == noPilot, state == inactive || state == acquisition);
    if (pilot != noPilot) pilots.insert(pilot);
  }
  EXPECT_GE(pilots.size(), 4u);
}

TEST(CDMAModem, DataHaveAnAddressWithASession) {
  const auto all = messagesOf(0x1183, 30min);
  for (const Message& message : all) EXPECT_EQ(dataAddress(message) == 0, message.u8(37) == 0);
  EXPECT_GE(distinctValues(all, dataAddress).size(), 3u);
  EXPECT_EQ(distinctValues(all, [](const Message& message) { return message.u8(41); }).size(), 3u);
}

TEST(CDMAModem, BothHalvesHearTheSameMasts) {
  int voice_dbm = 0;
  unsigned reference = noPilot;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x119C) {
      const VoiceStatus status(message);
      voice_dbm = i8(message, status.subpackets.at(2) + 10) * 334 / 1000 - 63;
      reference = status.strengths_db.empty() || status.state == sleeping ? noPilot : status.reference;
    }
    if (message.code() != 0x1183 || message.u16(18) == noPilot || reference == noPilot) continue;
    EXPECT_NEAR(i8(message, 15), voice_dbm, 10);
  }
}

// The linear strengths of the pilots of 0x12B6, by their offsets.
std::map<unsigned, double> pilotsOf(const Message& message) {
  std::map<unsigned, double> pilots;
  for (std::size_t record = 25; record < message.packet.size(); record += 12)
    pilots[message.u16(record)] = message.u16(record + 2) / 512.0;
  return pilots;
}

TEST(CDMAModem, ActiveSetsAreBelievable) {
  unsigned state = inactive, serving = noPilot;
  std::set<std::size_t> counts;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x1183) {
      state = message.u8(36);
      serving = message.u16(18);
    }
    if (message.code() != 0x12B6) continue;
    ASSERT_EQ(message.packet.size(), 25 + 12 * message.u8(15));
    const auto pilots = pilotsOf(message);
    counts.insert(pilots.size());
    EXPECT_EQ(pilots.empty(), serving == noPilot);
    if (state != connected) {
      EXPECT_LE(pilots.size(), 1u);
    }
    EXPECT_TRUE(pilots.empty() || pilots.contains(serving));
    double sum = 0;
    for (const auto& [pilot, strength] : pilots) {
      EXPECT_LE(pilot, 511u);
      EXPECT_GT(strength, 0);
      sum += strength;
    }
    EXPECT_LE(sum, 1.0);
  }
  EXPECT_THAT(counts, IsSupersetOf({0u, 1u, 2u}));
}

TEST(CDMAModem, FingersFollowThePilotsOfTheActiveSet) {
  unsigned state = inactive;
  std::map<unsigned, double> pilots;
  std::set<int> assigned;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x1183) state = message.u8(36);
    if (message.code() == 0x12B6) pilots = pilotsOf(message);
    if (message.code() != 0x108A) continue;
    const unsigned count = message.u8(22);
    ASSERT_EQ(message.packet.size(), 23 + 14 * count);
    EXPECT_EQ(count, state == inactive ? 0u : 6u);
    int used = 0;
    for (std::size_t record = 23; record < message.packet.size(); record += 14) {
      const unsigned pilot = message.u16(record);
      if (pilot == noPilot) continue;
      ++used;
      ASSERT_TRUE(pilots.contains(pilot));
      // No path carries more than its pilot; both are whole 512ths.
      const double ratio = message.u16(record + 6) / 512.0, strength = pilots[pilot] + 1 / 512.0;
      EXPECT_GT(ratio, 0);
      EXPECT_LE(ratio, strength / (1 - std::min(strength, 0.99)));
    }
    EXPECT_EQ(used == 0, pilots.empty());
    assigned.insert(used);
  }
  EXPECT_THAT(assigned, IsSupersetOf({0, 1, 2, 3, 4}));
}

// The number of bits that the counters of a packet stand for, from the sizes of the counted packets.
std::int64_t receivedBits(const Message& message) {
  constexpr std::int64_t sizes[] = {128,  256,  512,  1024, 0,    128, 256,  512,  1024, 0,    128, 256,
                                    512,  1024, 0,    128,  256,  512, 1024, 0,    128,  256,  512, 1024,
                                    0,    512,  1024, 2048, 0,    128, 256,  512,  1024, 0,    512, 1024,
                                    2048, 0,    1024, 3072, 0,    512, 1024, 2048, 0,    4096, 0,   1024,
                                    3072, 0,    4096, 0,    5120, 0,   5120, 0};
  static_assert(std::size(sizes) == 56);
  std::int64_t bits = 0;
  for (std::size_t i = 0; i < std::size(sizes); ++i) bits += sizes[i] * message.u32(17 + 4 * i);
  return bits;
}
std::int64_t sentBits(const Message& message) {
  constexpr std::int64_t sizes[] = {128, 256, 512, 768, 1024, 1536, 2048, 3072, 4096, 6144, 8192, 12288};
  std::int64_t bits = 0;
  for (std::size_t size = 0; size < std::size(sizes); ++size) {
    for (std::size_t block = 0; block < 3; ++block) {
      for (const std::size_t start : {18, 306}) {
        for (std::size_t counter = 0; counter < 16; counter += 4)
          bits += sizes[size] * message.u32(start + 24 * size + 576 * block + counter);
      }
    }
  }
  return bits;
}

struct Link {
  unsigned code;
  std::size_t size, sequence;
  std::int64_t (*bits)(const Message&);
  double mostKilobits;  // a second
};

class CDMARates : public testing::TestWithParam<Link> {};

TEST_P(CDMARates, FlowWhileThereIsAConnectionOnly) {
  const Link& link = GetParam();
  unsigned state = inactive, session = 0;
  bool wasConnected = false, wasInterrupted = false;  // at any time since the last packet
  std::optional<Message> last;
  std::set<std::int64_t> rates;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x1183) {
      state = message.u8(36);
      session = message.u8(37);
    }
    const bool isConnected = state == connected && session == sessionOpen;
    wasConnected = wasConnected || isConnected;
    wasInterrupted = wasInterrupted || !isConnected;
    if (message.code() != link.code) continue;
    ASSERT_EQ(message.packet.size(), link.size);
    if (last) {
      EXPECT_EQ(message.u32(link.sequence), last->u32(link.sequence) + 1);
      EXPECT_EQ(message.at - last->at, 1s);
      const std::int64_t bits = link.bits(message) - link.bits(*last);
      EXPECT_GE(bits, 0);
      EXPECT_TRUE(bits == 0 || wasConnected) << message.at.count();
      EXPECT_TRUE(bits > 0 || wasInterrupted) << message.at.count();
      EXPECT_LE(static_cast<double>(bits) / 1024, link.mostKilobits);
      rates.insert(bits / 1024);
    }
    last = message;
    wasConnected = isConnected;
    wasInterrupted = !isConnected;
  }
  EXPECT_GE(rates.size(), 50u);
}

INSTANTIATE_TEST_SUITE_P(Links, CDMARates,
                         testing::Values(Link{0x1192, 241, 13, receivedBits, 3000},
                                         Link{0x127E, 1750, 14, sentBits, 1800}),
                         [](const auto& info) { return info.param.code == 0x1192 ? "Forward" : "Reverse"; });

TEST(CDMAModem, TheForwardRateFollowsThePilot) {
  double strength = 0;
  std::map<bool, std::pair<double, int>> bits;  // bits and seconds; the key says whether the pilot is strong
  std::optional<Message> last;
  unsigned state = inactive, serving = noPilot;
  for (const Message& message : messages(1, 60min)) {
    if (message.code() == 0x1183) {
      state = message.u8(36);
      serving = message.u16(18);
    }
    if (message.code() == 0x12B6) strength = serving == noPilot ? 0 : pilotsOf(message)[serving];
    if (message.code() != 0x1192) continue;
    if (last && state == connected && (strength > 0.9 || strength < 0.6)) {
      auto& [sum, seconds] = bits[strength > 0.9];
      sum += static_cast<double>(receivedBits(message) - receivedBits(*last));
      ++seconds;
    }
    last = message;
  }
  ASSERT_GT(bits[true].second, 60);
  ASSERT_GT(bits[false].second, 60);
  EXPECT_GT(bits[true].first / bits[true].second, 3 * bits[false].first / bits[false].second);
}

TEST(CDMAModem, TheSystemIsToldOnceItIsKnown) {
  unsigned voice = 11;
  for (const Message& message : messages(1, 40min)) {
    if (message.code() == 0x119C) voice = VoiceStatus(message).state;
    if (message.code() == 0x134F) {
      EXPECT_THAT(voice, AnyOf(paging, sleeping, traffic));
    }
  }
}

TEST(CDMAModem, SystemsAreBelievable) {
  for (const Message& message : messagesOf(0x134F, 40min)) {
    ASSERT_EQ(message.packet.size(), 186u);
    EXPECT_GE(message.u8(13), 2u);
    EXPECT_EQ(message.u32(46), 2u);
    EXPECT_THAT(message.u16(184), AllOf(Ge(101u), Le(111u)));
  }
}

TEST(CDMAModem, TheWalkLeadsThroughSystems) {
  const auto all = messagesOf(0x134F, 40min);
  const auto u16 = [&all](std::size_t offset) {
    return distinctValues(all, [=](const Message& message) { return message.u16(offset); });
  };
  const auto u8 = [&all](std::size_t offset) {
    return distinctValues(all, [=](const Message& message) { return message.u8(offset); });
  };
  EXPECT_THAT(distinctValues(all, [](const Message& message) { return message.u32(42); }),
              UnorderedElementsAre(0u, 7u))
      << "roaming indicators";
  EXPECT_EQ(u16(50).size(), 2u) << "systems";
  EXPECT_EQ(u16(52).size(), 2u) << "networks";
  EXPECT_EQ(u8(131).size(), 3u) << "packet zones";
  EXPECT_THAT(u8(133), UnorderedElementsAre(6u, 9u)) << "protocol revisions";
  EXPECT_EQ(u16(184).size(), 6u) << "base stations";
}

}  // namespace
}  // namespace varnel
