#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "tests/support/DistinctValues.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::AllOf;
using testing::Ge;
using testing::IsSupersetOf;
using testing::Le;
using testing::MatchesRegex;
using testing::UnorderedElementsAre;

std::vector<SimulatedMessage> messages(std::uint64_t seed, std::chrono::milliseconds duration) {
  const auto modem = simulatedModem("ifx-gsm", seed);
  std::vector<SimulatedMessage> messages;
  for (SimulatedMessage next = modem->next(); next.at <= duration; next = modem->next())
    messages.push_back(next);
  return messages;
}

std::vector<Value> pictures(std::chrono::milliseconds duration, std::uint64_t seed = 1) {
  std::vector<Value> pictures;
  for (const SimulatedMessage& message : messages(seed, duration))
    pictures.push_back(readPropertyList(message.bytes).value_or(Value()));
  return pictures;
}

// The text at the end of a path of keys.
std::string textAt(Value value, const std::vector<std::string_view>& path) {
  for (const std::string_view key : path) {
    if (!value.dictionary()) return "(no dictionary above " + std::string(key) + ")";
    value = value.dictionary()->get(key);
  }
  return value.string() ? *value.string() : "(none)";
}
std::string activityIn(const Value& picture) { return textAt(picture, {"Picture", "Header", "Activity"}); }

const Array& arrayAt(const Value& picture, std::string_view key) {
  static const Array none;
  const Array* array = picture.dictionary()->get(key).array();
  return array ? *array : none;
}

TEST(ObjectStreamModem, TheSameSeedGivesTheSameMessages) {
  const auto one = simulatedModem("ifx-gsm", 42), other = simulatedModem("ifx-gsm", 42);
  for (int i = 0; i < 1000; ++i) {
    const SimulatedMessage first = one->next(), second = other->next();
    ASSERT_EQ(first.at, second.at) << i;
    ASSERT_EQ(first.bytes, second.bytes) << i;
  }
}

TEST(ObjectStreamModem, AnotherSeedGivesOtherMessages) {
  EXPECT_NE(messages(1, 1s).at(0).bytes, messages(2, 1s).at(0).bytes);
}

TEST(ObjectStreamModem, TimeNeverGoesBack) {
  EXPECT_TRUE(std::ranges::is_sorted(messages(3, 10min), {}, &SimulatedMessage::at));
}

TEST(ObjectStreamModem, APictureASecondAndSomeMore) {
  EXPECT_THAT(messages(4, 5min).size(), AllOf(Ge(300u), Le(450u)));
}

TEST(ObjectStreamModem, MessagesArePropertyListsOfBothEncodingsAndNothingElse) {
  std::set<std::string> beginnings;
  for (const SimulatedMessage& message : messages(1, 2min)) {
    ASSERT_GE(message.bytes.size(), 6u);
    beginnings.emplace(message.bytes.begin(), message.bytes.begin() + 6);
  }
  EXPECT_THAT(beginnings, UnorderedElementsAre("bplist", "<?xml "));
}

// The contents of a tree of values.
struct Census {
  int arrays = 0, wrappers = 0, chains = 0, others = 0;

  static bool isWrapper(const Value& value) { return value.dictionary() && value.dictionary()->size() == 1; }

  void count(const Value& value) {
    if (const Array* array = value.array()) {
      ++arrays;
      // The name of the elements comes first.
      EXPECT_TRUE(!array->empty() && array->front().string());
      for (const Value& element : *array) count(element);
    } else if (const Dictionary* dictionary = value.dictionary()) {
      EXPECT_FALSE(dictionary->empty());
      wrappers += isWrapper(value);
      chains += isWrapper(value) && isWrapper(dictionary->begin()->value);
      for (const auto& entry : *dictionary) count(entry.value);
    } else {
      others += value.string() == nullptr;
    }
  }
};

TEST(ObjectStreamModem, PicturesAreTextsInDictionariesAndArraysThatBeginWithAName) {
  for (const Value& picture : pictures(5min)) {
    ASSERT_NE(picture.dictionary(), nullptr);
    ASSERT_GT(picture.dictionary()->size(), 1u);
    Census census;
    census.count(picture);
    EXPECT_EQ(census.others, 0);
    EXPECT_EQ(census.arrays, 2);
    EXPECT_GE(census.wrappers, 10);
    EXPECT_GE(census.chains, 4);
  }
}

TEST(ObjectStreamModem, EveryPictureIsWhole) {
  for (const Value& picture : pictures(5min)) {
    std::vector<std::string> sections;
    for (const auto& entry : *picture.dictionary()) sections.push_back(entry.key);
    EXPECT_THAT(sections, testing::ElementsAre("Picture", "Serving Cell", "Neighbor Cells", "Radio Resources",
                                               "Mobility Management", "Packet Data", "Call", "Events"));
  }
}

TEST(ObjectStreamModem, PicturesAreNumberedAndDated) {
  int number = 0;
  for (const Value& picture : pictures(2min))
    EXPECT_EQ(textAt(picture, {"Picture", "Header", "Number"}), std::to_string(++number));
  EXPECT_EQ(textAt(pictures(65s + 500ms).back(), {"Picture", "Header", "Uptime", "Time"}), "0:01:05");
}

std::string servingCellAt(const Value& picture, std::vector<std::string_view> path) {
  path.insert(path.begin(), "Serving Cell");
  return textAt(picture, path);
}

TEST(ObjectStreamModem, ServingCellsAreBelievable) {
  for (const Value& picture : pictures(40min)) {
    EXPECT_EQ(servingCellAt(picture, {"PLMN", "Network"}), "001-100");
    EXPECT_THAT(servingCellAt(picture, {"LAC", "Area"}), MatchesRegex("0x[0-9A-F]{4}"));
    EXPECT_THAT(servingCellAt(picture, {"Cell ID"}), MatchesRegex("120(00|02|04|06|08|10)"));
    EXPECT_EQ(servingCellAt(picture, {"Band"}), "GSM 900");
    EXPECT_THAT(std::stoi(servingCellAt(picture, {"ARFCN"})), AllOf(Ge(10), Le(50)));
    EXPECT_THAT(servingCellAt(picture, {"BSIC", "Colors"}), MatchesRegex("[0-7]/[0-7] \\(NCC/BCC\\)"));
    const int level_dbm = std::stoi(servingCellAt(picture, {"RxLev", "Level"}));
    EXPECT_THAT(level_dbm, AllOf(Ge(-104), Le(-40)));
    EXPECT_EQ(servingCellAt(picture, {"C1", "Decibels"}), std::to_string(level_dbm + 104) + " dB");
  }
}

TEST(ObjectStreamModem, TheWalkLeadsThroughCellsOfEveryArea) {
  const auto all = pictures(40min);
  const auto valuesOf = [&all](const std::vector<std::string_view>& path) {
    return distinctValues(all, [&](const Value& picture) { return servingCellAt(picture, path); });
  };
  EXPECT_EQ(valuesOf({"Cell ID"}).size(), 6u);
  EXPECT_EQ(valuesOf({"LAC", "Area"}).size(), 3u);
  EXPECT_GE(valuesOf({"RxLev", "Level"}).size(), 30u);
}

TEST(ObjectStreamModem, NeighborsComeStrongestFirstAndEnterAndLeave) {
  std::set<std::size_t> counts;
  for (const Value& picture : pictures(40min)) {
    const Array& cells = arrayAt(picture, "Neighbor Cells");
    ASSERT_FALSE(cells.empty());
    EXPECT_EQ(*cells[0].string(), "Neighbor Cell");
    int above_dbm = 0;
    for (std::size_t i = 1; i < cells.size(); ++i) {
      const int level_dbm = std::stoi(textAt(cells[i], {"RxLev", "Level"}));
      EXPECT_THAT(level_dbm, AllOf(Ge(-100), Le(above_dbm)));
      EXPECT_THAT(std::stoi(textAt(cells[i], {"ARFCN"})), AllOf(Ge(10), Le(50)));
      above_dbm = level_dbm;
    }
    counts.insert(cells.size() - 1);
  }
  EXPECT_GE(counts.size(), 3u);
  EXPECT_LE(*counts.rbegin(), 5u);
}

TEST(ObjectStreamModem, LayersAgreeOnWhatThePhoneDoes) {
  struct States {
    std::string radioResources, channel, call, packets;
    bool operator==(const States&) const = default;
  };
  const std::map<std::string, States> expected = {
      {"Idle", {"RR idle", "BCCH + CCCH", "U0 Null", "Packet idle"}},
      {"Location access", {"RR connection pending", "RACH", "U0 Null", "Packet idle"}},
      {"Location update", {"RR connected", "SDCCH/8", "U0 Null", "Packet idle"}},
      {"Call access", {"RR connection pending", "RACH", "U0.1 MM connection pending", "Packet idle"}},
      {"Call setup", {"RR connected", "SDCCH/8", "U3 Mobile originating call proceeding", "Packet idle"}},
      {"Call", {"RR connected", "TCH/F", "U10 Active", "Packet idle"}},
      {"Call release", {"RR connected", "TCH/F", "U19 Release request", "Packet idle"}},
      {"Packet access", {"RR idle", "RACH", "U0 Null", "Packet access"}},
      {"Packet transfer", {"RR idle", "PDTCH", "U0 Null", "Packet transfer"}},
  };
  std::set<std::string> activities;
  for (const Value& picture : pictures(3min)) {
    const std::string activity = activityIn(picture);
    activities.insert(activity);
    EXPECT_TRUE(
        (expected.at(activity) == States{textAt(picture, {"Radio Resources", "State", "RR", "State"}),
                                         textAt(picture, {"Radio Resources", "Channel", "Channel Type"}),
                                         textAt(picture, {"Call", "Call Control", "State"}),
                                         textAt(picture, {"Packet Data", "State", "Packet RR", "State"})}))
        << activity;
    const bool isDedicated = textAt(picture, {"Radio Resources", "State", "RR", "State"}) == "RR connected";
    EXPECT_THAT(textAt(picture, {"Radio Resources", "RxQual"}), MatchesRegex(isDedicated ? "[0-7]" : "-"));
    EXPECT_THAT(textAt(picture, {"Radio Resources", "Tx Power", "Level"}),
                MatchesRegex(isDedicated ? "[0-9]+ dBm" : ".no dictionary.*"));
    EXPECT_THAT(textAt(picture, {"Packet Data", "Coding Scheme"}),
                MatchesRegex(activity == "Packet transfer" ? "MCS-[1-9]" : "-"));
  }
  EXPECT_EQ(activities.size(), expected.size());
}

TEST(ObjectStreamModem, ThePhoneCallsAndTransfersWithinAMinute) {
  for (std::uint64_t seed = 1; seed <= 20; ++seed) {
    std::set<std::string> activities;
    for (const Value& picture : pictures(1min, seed)) activities.insert(activityIn(picture));
    EXPECT_THAT(activities, IsSupersetOf({"Idle", "Location update", "Call", "Packet transfer"})) << seed;
  }
}

TEST(ObjectStreamModem, BytesFlowWhileThereIsATransferOnly) {
  std::int64_t received = 0;
  std::string before = "Idle";
  int transfers = 0;
  for (const Value& picture : pictures(5min)) {
    const std::int64_t next = std::stoll(textAt(picture, {"Packet Data", "Received", "Bytes"}));
    EXPECT_GE(next, received);
    if (next > received) {
      EXPECT_TRUE(before == "Packet transfer" || activityIn(picture) == "Packet transfer") << before;
      ++transfers;
    }
    received = next;
    before = activityIn(picture);
  }
  EXPECT_GE(transfers, 20);
}

TEST(ObjectStreamModem, AnUpdateOfTheLocationGivesOtherIdentities) {
  std::string area, identity;
  int updates = 0;
  for (const Value& picture : pictures(40min)) {
    if (textAt(picture, {"Mobility Management", "Update Status"}) != "U1 UPDATED") continue;
    const std::string nextArea = textAt(picture, {"Serving Cell", "LAC", "Area"}),
                      nextIdentity = textAt(picture, {"Mobility Management", "TMSI", "Identity"});
    if (nextArea != area && !area.empty()) {
      EXPECT_NE(nextIdentity, identity);
    }
    updates += nextIdentity != identity;
    area = nextArea;
    identity = nextIdentity;
  }
  EXPECT_GE(updates, 4);
}

TEST(ObjectStreamModem, BeforeItIsLocatedThePhoneSaysSo) {
  const Value first = pictures(100ms).at(0);
  EXPECT_EQ(textAt(first, {"Mobility Management", "MM State", "MM", "State"}),
            "MM IDLE, LOCATION UPDATE NEEDED");
  EXPECT_EQ(textAt(first, {"Mobility Management", "GMM State", "GMM", "State"}),
            "GMM-REGISTERED.UPDATE-NEEDED");
  EXPECT_EQ(textAt(first, {"Mobility Management", "Update Status"}), "U2 NOT UPDATED");
  EXPECT_EQ(textAt(first, {"Mobility Management", "T3212", "Time"}), "-");
  const Value later = pictures(10s).back();
  EXPECT_EQ(textAt(later, {"Mobility Management", "Update Status"}), "U1 UPDATED");
  EXPECT_THAT(textAt(later, {"Mobility Management", "T3212", "Time"}), MatchesRegex("0:29:5[0-9]"));
}

TEST(ObjectStreamModem, TheLastEightEventsAreTold) {
  const auto all = pictures(5min);
  EXPECT_EQ(arrayAt(all.front(), "Events").size(), 1u);
  const Array& events = arrayAt(all.back(), "Events");
  ASSERT_EQ(events.size(), 9u);
  for (std::size_t i = 1; i < events.size(); ++i)
    EXPECT_THAT(*events[i].string(), MatchesRegex("0:0[0-5]:[0-5][0-9] [A-Z].*"));
  EXPECT_TRUE(std::is_sorted(events.begin() + 1, events.end(), [](const Value& one, const Value& other) {
    return one.string()->substr(0, 7) < other.string()->substr(0, 7);
  }));
}

}  // namespace
}  // namespace varnel
