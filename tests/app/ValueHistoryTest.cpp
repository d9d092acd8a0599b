#include "app/ValueHistory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <malloc.h>

#include <limits>
#include <map>
#include <random>

#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

constexpr std::int64_t noon = 1'700'000'000;

// When packets wrote the entries with these keys.
class Written final : public WriteTimes {
 public:
  std::optional<Time> writtenAt(const Dictionary& /*entries*/, std::string_view key) const override {
    const auto found = times.find(std::string(key));
    return found == times.end() ? std::nullopt : std::optional(Time{.seconds = found->second});
  }
  std::map<std::string, std::int64_t> times;
};

class ValueHistoryTest : public testing::Test {
 protected:
  ValueHistoryTest() {
    NumberFormats formats;
    formats.add("Cell", "RSRP", real("%.2f dBm"));
    formats.add("Cell", "RSRQ", real("%.2f dB"));
    formats.add("Neighbors", "RSRP", real("%.2f dBm"));
    history.setFormats(formats);
  }

  // So many seconds after noon.
  void show(const Value& display, std::int64_t second) { show(display, Time{.seconds = noon + second}); }
  void show(const Value& display, Time now) {
    paths.clear();
    history.add(VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths, written), now);
  }
  void showLevel(std::string_view text, std::int64_t second) { show(levelDisplay(text), second); }
  static Value levelDisplay(std::string_view text) {
    return dictionaryOf({{"Cell", dictionaryOf({{"RSRP", text}})}});
  }

  ValueHistory::Number number(std::string_view key) const {
    const auto found = history.seriesOfKey(key);
    EXPECT_TRUE(found) << key;
    return found.value_or(ValueHistory::Number(~0ULL));
  }
  std::vector<ValueHistory::Sample> samples(std::string_view key) const {
    return history.samples(number(key), history.whole());
  }
  // "second:value", with "!" for a value that a packet has renewed and "|" before one that follows a gap.
  std::vector<std::string> course(std::string_view key) const {
    std::vector<std::string> texts;
    for (const auto& sample : samples(key)) {
      texts.push_back((sample.followsGap ? "|" : "") + std::to_string(sample.time.seconds - noon) + ":" +
                      testing::PrintToString(sample.value) + (sample.isRenewed ? "!" : ""));
    }
    return texts;
  }
  std::vector<std::string> keys() const {
    std::vector<std::string> found;
    for (const auto each : history.series()) found.emplace_back(history.key(each));
    return found;
  }

  Written written;
  PathDictionary paths;
  ValueHistory history;
};

// ---- What has a series ----

TEST_F(ValueHistoryTest, EveryNumberHasASeriesAndTextsHaveNone) {
  show(dictionaryOf({{"Cell", dictionaryOf({{"RSRP", "-84.00 dBm"},
                                            {"PCI", "16"},
                                            {"State", "Idle"},
                                            {"Empty", ""},
                                            {"Time", "12:00"},
                                            {"Subscriber", "12345678901"}})}}),
       0);
  EXPECT_THAT(keys(), UnorderedElementsAre("/Cell/RSRP", "/Cell/PCI"));
  EXPECT_THAT(course("/Cell/RSRP"), ElementsAre("|0:-84!"));
  EXPECT_EQ(history.unit(number("/Cell/RSRP")), "dBm");
  EXPECT_EQ(history.name(number("/Cell/RSRP")), "RSRP");
  EXPECT_EQ(history.record(number("/Cell/RSRP")), "");
  EXPECT_EQ(history.unit(number("/Cell/PCI")), "");
}

TEST_F(ValueHistoryTest, ARowFindsItsSeriesByItsNode) {
  show(dictionaryOf({{"Cell", dictionaryOf({{"RSRP", "-84.00 dBm"}, {"State", "Idle"}})}}), 0);
  EXPECT_EQ(history.seriesOf(*paths.at("/Cell/RSRP")), number("/Cell/RSRP"));
  EXPECT_EQ(history.seriesOf(*paths.at("/Cell/State")), std::nullopt);
  EXPECT_EQ(history.seriesOf(*paths.at("/Cell")), std::nullopt);
  const auto old = paths.at("/Cell/RSRP");
  showLevel("-85.00 dBm", 2);
  EXPECT_EQ(history.seriesOf(*old), std::nullopt) << "a row of the display before";
  EXPECT_EQ(history.seriesOf(*paths.at("/Cell/RSRP")), number("/Cell/RSRP"));
}

TEST_F(ValueHistoryTest, SeriesAreFoundByTheirUnit) {
  show(dictionaryOf({{"Cell", dictionaryOf({{"RSRP", "-84.00 dBm"}, {"RSRQ", "-9.00 dB"}, {"PCI", "16"}})}}),
       0);
  EXPECT_THAT(history.seriesOfUnit("dBm"), ElementsAre(number("/Cell/RSRP")));
  EXPECT_THAT(history.seriesOfUnit("dB"), ElementsAre(number("/Cell/RSRQ")));
  EXPECT_THAT(history.seriesOfUnit("m"), IsEmpty());
}

TEST_F(ValueHistoryTest, ASeriesThatHasGoneYieldsNothing) {
  constexpr ValueHistory::Number nobody{7};
  EXPECT_FALSE(history.has(nobody));
  EXPECT_EQ(history.key(nobody), "");
  EXPECT_EQ(history.name(nobody), "");
  EXPECT_EQ(history.record(nobody), "");
  EXPECT_EQ(history.unit(nobody), "");
  EXPECT_THAT(history.samples(nobody, {0s, 100s}), IsEmpty());
  EXPECT_EQ(history.summary(nobody, {0s, 100s}).count, 0U);
  EXPECT_TRUE(history.columns(nobody, {0s, 100s}, 1).at(0).isEmpty);
}

TEST_F(ValueHistoryTest, AnotherGeneratorHasOtherFormatsAndTheSeriesGoOn) {
  showLevel("-84.00 dBm", 0);
  NumberFormats formats;
  formats.add("Cell", "RSRP", integer("%d asu"));
  history.setFormats(formats);
  showLevel("57 asu", 2);
  EXPECT_THAT(course("/Cell/RSRP"), ElementsAre("|0:-84!", "2:57!"));
  EXPECT_EQ(history.unit(number("/Cell/RSRP")), "asu");
}

TEST_F(ValueHistoryTest, ValuesOfDifferentUnitsAreNeverInOneSeries) {
  NumberFormats formats;
  formats.add("Cell", "RSSI", integer("%d dBm"));
  formats.add("Cell", "RSSI", integer());
  history.setFormats(formats);
  const auto showLevelOf = [&](std::string_view text, std::int64_t second) {
    show(dictionaryOf({{"Cell", dictionaryOf({{"RSSI", text}})}}), second);
  };
  showLevelOf("-80 dBm", 0);
  showLevelOf("30", 2);
  EXPECT_EQ(history.seriesOf(*paths.at("/Cell/RSSI")), number("/Cell/RSSI in 1"));
  showLevelOf("-82 dBm", 4);
  EXPECT_EQ(history.seriesOf(*paths.at("/Cell/RSSI")), number("/Cell/RSSI in dBm"));
  EXPECT_THAT(course("/Cell/RSSI in dBm"), ElementsAre("|0:-80!", "|4:-82!"));
  EXPECT_THAT(course("/Cell/RSSI in 1"), ElementsAre("|2:30!"));
  EXPECT_EQ(history.unit(number("/Cell/RSSI in dBm")), "dBm");
  EXPECT_EQ(history.unit(number("/Cell/RSSI in 1")), "");
  EXPECT_EQ(history.name(number("/Cell/RSSI in dBm")), "RSSI");
}

TEST_F(ValueHistoryTest, AfterClearNothingIsLeft) {
  showLevel("-84.00 dBm", 0);
  history.clear();
  EXPECT_THAT(history.series(), IsEmpty());
  EXPECT_EQ(history.seriesOf(*paths.at("/Cell/RSRP")), std::nullopt);
  EXPECT_EQ(history.whole().end, 0s);
  EXPECT_EQ(history.notice(), "");
  showLevel("-85.00 dBm", 9);
  EXPECT_THAT(course("/Cell/RSRP"), ElementsAre("|9:-85!"));
}

TEST_F(ValueHistoryTest, NoDisplayIsNoGeneration) {
  history.add(nullptr, Time{});
  EXPECT_THAT(history.series(), IsEmpty());
  EXPECT_EQ(history.last(10min).end, 0s);
}

// ---- Records of lists ----

Value neighbor(std::string_view channel, std::string_view cell, std::string_view level) {
  return dictionaryOf({{"EARFCN", channel}, {"Physical Cell ID", cell}, {"RSRP", level}});
}
Value neighbors(std::initializer_list<Value> records) {
  Value list = Value::ofArray();
  for (const Value& record : records) list.array()->push_back(record);
  return dictionaryOf({{"Neighbors", dictionaryOf({{"Cells", list}})}});
}

TEST_F(ValueHistoryTest, ASeriesFollowsItsCellThroughTheList) {
  show(neighbors({neighbor("1300", "16", "-80.00 dBm"), neighbor("1300", "17", "-90.00 dBm")}), 0);
  show(neighbors({neighbor("1300", "17", "-79.00 dBm"), neighbor("1300", "16", "-81.00 dBm")}), 2);
  EXPECT_THAT(course("/Neighbors/Cells[EARFCN 1300, PCI 16]/RSRP"), ElementsAre("|0:-80!", "2:-81!"));
  EXPECT_THAT(course("/Neighbors/Cells[EARFCN 1300, PCI 17]/RSRP"), ElementsAre("|0:-90!", "2:-79!"));
  EXPECT_EQ(history.seriesOf(*paths.at("/Neighbors/Cells/0/RSRP")),
            number("/Neighbors/Cells[EARFCN 1300, PCI 17]/RSRP"));
  EXPECT_EQ(history.unit(number("/Neighbors/Cells[EARFCN 1300, PCI 17]/RSRP")), "dBm");
}

TEST_F(ValueHistoryTest, TheSameCellOnAnotherChannelIsAnotherSeries) {
  show(neighbors({neighbor("1300", "16", "-80.00 dBm")}), 0);
  show(neighbors({neighbor("1450", "16", "-90.00 dBm")}), 2);
  EXPECT_THAT(course("/Neighbors/Cells[EARFCN 1300, PCI 16]/RSRP"), ElementsAre("|0:-80!"));
  EXPECT_THAT(course("/Neighbors/Cells[EARFCN 1450, PCI 16]/RSRP"), ElementsAre("|2:-90!"));
}

TEST_F(ValueHistoryTest, OfRecordsWithOneIdentityEachHasItsSeries) {
  const auto twice = neighbors({neighbor("1300", "16", "-80.00 dBm"), neighbor("1300", "16", "-90.00 dBm")});
  show(twice, 0);
  show(twice, 2);
  EXPECT_THAT(course("/Neighbors/Cells[EARFCN 1300, PCI 16]/RSRP"), ElementsAre("|0:-80!", "2:-80"));
  EXPECT_THAT(course("/Neighbors/Cells[EARFCN 1300, PCI 16]/RSRP (2)"), ElementsAre("|0:-90!", "2:-90"));
  EXPECT_EQ(history.name(number("/Neighbors/Cells[EARFCN 1300, PCI 16]/RSRP (2)")), "RSRP");
}

TEST_F(ValueHistoryTest, OfMoreRowsThanSixteenWithOneKeyTheOthersHaveNone) {
  Value list = Value::ofArray();
  for (int i = 0; i < 40; ++i) list.array()->push_back(dictionaryOf({{"SSB", "1"}, {"RSRP", "5"}}));
  show(dictionaryOf({{"Beams", list}}), 0);
  EXPECT_EQ(history.series().size(), 2U * 16);
}

TEST_F(ValueHistoryTest, RecordsWithoutIdentityAndListsOfTextsHaveNone) {
  show(dictionaryOf({{"Messages", Value::ofArray({dictionaryOf({{"Length", "12"}, {"EARFCN", "1300"}})})},
                     {"Contexts", Value::ofArray({dictionaryOf({{"Sent", "12"}})})},
                     {"ARFCNs", Value::ofArray({"62", "63"})},
                     {"Nested", Value::ofArray({Value::ofArray({dictionaryOf({{"SSB", "1"}})})})}}),
       0);
  EXPECT_THAT(keys(), IsEmpty());
}

TEST_F(ValueHistoryTest, ListsWithinRecordsAreNamedByBoth) {
  const Value cell =
      dictionaryOf({{"Physical Cell ID", "44"},
                    {"RSRP", "-90"},
                    {"Beams", Value::ofArray({dictionaryOf({{"SSB", "2"}, {"Level", "-91"}})})}});
  const auto layers = [&](std::string_view servingCell) {
    return dictionaryOf({{"Layers", Value::ofArray({dictionaryOf({{"NR-ARFCN", "620000"},
                                                                  {"Serving Cell", servingCell},
                                                                  {"RSRP Rx0", "-88"},
                                                                  {"Cells", Value::ofArray({cell})}})})}});
  };
  show(layers("44"), 0);
  show(layers("45"), 2);
  EXPECT_THAT(course("/Layers[NR-ARFCN 620000]/Cells[PCI 44]/RSRP"), ElementsAre("|0:-90!", "2:-90"));
  EXPECT_EQ(history.record(number("/Layers[NR-ARFCN 620000]/Cells[PCI 44]/Beams[SSB 2]/Level")),
            "NR-ARFCN 620000, PCI 44, SSB 2");
  EXPECT_THAT(course("/Layers[NR-ARFCN 620000]/Cells[PCI 44]/Beams[SSB 2]/Level"),
              ElementsAre("|0:-91!", "2:-91"));
  EXPECT_THAT(course("/Layers[NR-ARFCN 620000, Serving PCI 44]/RSRP Rx0"), ElementsAre("|0:-88!"));
  EXPECT_THAT(course("/Layers[NR-ARFCN 620000, Serving PCI 45]/RSRP Rx0"), ElementsAre("|2:-88!"));
}

TEST_F(ValueHistoryTest, PilotsOfOnePNInASortedSetAreTold) {
  show(dictionaryOf(
           {{"Fingers", dictionaryOf({{"_sorted", ""}, {"0;84", "1"}, {"1;84", "2"}, {"2;90", "3"}})}}),
       0);
  EXPECT_THAT(keys(), UnorderedElementsAre("/Fingers/84", "/Fingers/84 (2)", "/Fingers/90"));
}

// ---- Renewal and gaps ----

TEST_F(ValueHistoryTest, AValueIsRenewedWhenAPacketHasWrittenItSince) {
  written.times["RSRP"] = noon;
  showLevel("-84.00 dBm", 0);
  showLevel("-84.00 dBm", 2);
  written.times["RSRP"] = noon + 3;
  showLevel("-84.00 dBm", 4);
  EXPECT_THAT(course("/Cell/RSRP"), ElementsAre("|0:-84!", "2:-84", "4:-84!"));
}

TEST_F(ValueHistoryTest, APacketOfAClockThatStepsBackRenewsToo) {
  written.times["RSRP"] = noon;
  showLevel("-84.00 dBm", 0);
  written.times["RSRP"] = noon - 3600;
  showLevel("-84.00 dBm", 2);
  EXPECT_THAT(course("/Cell/RSRP"), ElementsAre("|0:-84!", "2:-84!"));
}

TEST_F(ValueHistoryTest, WithoutTimesAValueIsRenewedWhenItHasChanged) {
  showLevel("-84.00 dBm", 0);
  showLevel("-84.00 dBm", 2);
  showLevel("-85.00 dBm", 4);
  EXPECT_THAT(course("/Cell/RSRP"), ElementsAre("|0:-84!", "2:-84", "4:-85!"));
}

TEST_F(ValueHistoryTest, ACellOfAListIsRenewedWhenItWasSeen) {
  const auto cells = [](std::string_view seen) {
    return dictionaryOf(
        {{"Cells", Value::ofArray(
                       {dictionaryOf({{"Physical Cell ID", "16"}, {"RSRP", "-84"}, {"Last Seen", seen}})})}});
  };
  written.times["Cells"] = noon;
  show(cells("12:00:00"), 0);
  written.times["Cells"] = noon + 2;  // another cell was seen
  show(cells("12:00:00"), 2);
  written.times["Cells"] = noon + 4;
  show(cells("12:00:04"), 4);
  EXPECT_THAT(course("/Cells[PCI 16]/RSRP"), ElementsAre("|0:-84!", "2:-84", "4:-84!"));
}

TEST_F(ValueHistoryTest, ARowThatWasNotThereLeavesAGap) {
  showLevel("-84.00 dBm", 0);
  show(dictionaryOf({}), 2);
  showLevel("-84.00 dBm", 4);
  showLevel("no signal 1", 6);
  showLevel("-84.00 dBm", 8);
  EXPECT_THAT(course("/Cell/RSRP"), ElementsAre("|0:-84!", "|4:-84", "|8:-84"));
}

TEST_F(ValueHistoryTest, MoreThanTenSecondsWithoutAGenerationAreAGap) {
  showLevel("-84.00 dBm", 0);
  showLevel("-84.00 dBm", 10);
  showLevel("-84.00 dBm", 21);
  EXPECT_THAT(course("/Cell/RSRP"), ElementsAre("|0:-84!", "10:-84", "|21:-84"));
}

// ---- The axis ----

TEST_F(ValueHistoryTest, OneRecordThatOvertakesAnotherTakesNoTime) {
  showLevel("1", 0);
  showLevel("2", 6);
  showLevel("3", 5);
  showLevel("4", 8);
  const auto all = samples("/Cell/RSRP");
  ASSERT_EQ(all.size(), 4U);
  EXPECT_EQ(all[1].at, 6s);
  EXPECT_EQ(all[2].at, 6s);
  EXPECT_EQ(all[2].time.seconds, noon + 5);
  EXPECT_EQ(all[3].at, 8s);
}

TEST_F(ValueHistoryTest, AClockThatIsSetBackLosesNothing) {
  showLevel("1", 0);
  showLevel("2", 2);
  showLevel("3", -3600);
  showLevel("4", -3598);
  const auto all = samples("/Cell/RSRP");
  ASSERT_EQ(all.size(), 4U);
  EXPECT_EQ(all[2].at, 2s);
  EXPECT_EQ(all[2].time.seconds, noon - 3600);
  EXPECT_EQ(all[3].at, 4s);
  EXPECT_FALSE(all[3].followsGap);
  EXPECT_EQ(history.timeAt(3s), (Time{.seconds = noon - 3599}));
}

TEST_F(ValueHistoryTest, AClockThatLeapsByMoreThanADayLosesNothing) {
  showLevel("1", 0);
  showLevel("2", 86'401);
  showLevel("3", 86'403);
  const auto all = samples("/Cell/RSRP");
  ASSERT_EQ(all.size(), 3U);
  EXPECT_EQ(all[1].at, 0s);
  EXPECT_TRUE(all[1].followsGap);
  EXPECT_EQ(all[2].at, 2s);
}

TEST_F(ValueHistoryTest, TheTimesOfAnyCaptureAreTaken) {
  constexpr auto first = std::numeric_limits<std::int64_t>::min(),
                 last = std::numeric_limits<std::int64_t>::max();
  show(levelDisplay("1"), Time{.seconds = first});
  show(levelDisplay("2"), Time{.seconds = last});
  show(levelDisplay("3"), Time{.seconds = first});
  EXPECT_EQ(samples("/Cell/RSRP").size(), 3U);
}

TEST_F(ValueHistoryTest, APointOfTheAxisHasTheTimeOfTheClock) {
  show(levelDisplay("1"), Time{.seconds = noon, .nanoseconds = 900'000'000});
  show(levelDisplay("2"), Time{.seconds = noon + 2, .nanoseconds = 0});
  EXPECT_EQ(history.whole().end, 1100ms);
  EXPECT_EQ(history.timeAt(200ms), (Time{.seconds = noon + 1, .nanoseconds = 100'000'000}));
  EXPECT_EQ(history.timeAt(1100ms), (Time{.seconds = noon + 2}));
  EXPECT_EQ(history.timeAt(-1s), (Time{.seconds = noon - 1, .nanoseconds = 900'000'000}));
}

TEST_F(ValueHistoryTest, AfterAnHourSamplesAndThenTheirSeriesGo) {
  show(dictionaryOf({{"Cell", dictionaryOf({{"RSRP", "1"}, {"PCI", "16"}})}}), 0);
  showLevel("2", 2);
  showLevel("3", 3600);
  EXPECT_EQ(samples("/Cell/RSRP").size(), 3U);
  EXPECT_TRUE(history.seriesOfKey("/Cell/PCI"));
  showLevel("4", 3602);
  EXPECT_THAT(course("/Cell/RSRP"), ElementsAre("|2:2!", "|3600:3!", "3602:4!"));
  EXPECT_FALSE(history.seriesOfKey("/Cell/PCI"));
  EXPECT_EQ(history.notice(), "") << "that is no loss";
}

// ---- Queries ----

TEST_F(ValueHistoryTest, AStretchHasTheSamplesBetweenItsEnds) {
  for (int i = 0; i < 10; ++i) showLevel(std::to_string(i), i * 2);
  const auto level = number("/Cell/RSRP");
  EXPECT_EQ(history.samples(level, {4s, 8s}).size(), 3U);
  EXPECT_EQ(history.samples(level, {5s, 5s}).size(), 0U);
  EXPECT_EQ(history.samples(level, {8s, 4s}).size(), 0U);
  EXPECT_EQ(history.samples(level, {100s, 200s}).size(), 0U);
  EXPECT_EQ(history.samples(level, history.last(4s)).front().value, 7);
  EXPECT_EQ(history.last(4s).begin, 14s);
  EXPECT_EQ(history.last(4s).end, 18s);
}

TEST_F(ValueHistoryTest, ASummaryHasLowestMeanHighestAndLast) {
  for (const int value : {-80, -100, -90, -86}) showLevel(std::to_string(value) + ".00 dBm", -value);
  const auto summary = history.summary(number("/Cell/RSRP"), history.whole());
  EXPECT_EQ(summary.count, 4U);
  EXPECT_EQ(summary.lowest, -100);
  EXPECT_EQ(summary.mean, -89);
  EXPECT_EQ(summary.highest, -80);
  EXPECT_EQ(summary.last, -86);
}

// "lowest..highest"; "-" for an empty column, "=" before a value that stands, "|" before one after a gap.
std::vector<std::string> outline(const std::vector<ValueHistory::Column>& columns) {
  std::vector<std::string> texts;
  for (const auto& column : columns) {
    if (column.isEmpty) {
      texts.emplace_back("-");
    } else {
      texts.push_back((column.followsGap ? "|" : "") + std::string(column.count == 0 ? "=" : "") +
                      testing::PrintToString(column.lowest) + ".." + testing::PrintToString(column.highest));
    }
  }
  return texts;
}

TEST_F(ValueHistoryTest, AColumnKeepsTheLowestAndTheHighestOfItsSamples) {
  const int values[] = {1, 9, 2, 4, 6, 5};
  for (int i = 0; i < 6; ++i) showLevel(std::to_string(values[i]), i * 2);
  const auto columns = history.columns(number("/Cell/RSRP"), history.whole(), 2);
  EXPECT_THAT(outline(columns), ElementsAre("|1..9", "4..6"));
  EXPECT_EQ(columns[0].mean, 4);
  EXPECT_EQ(columns[0].last, 2);
  EXPECT_EQ(columns[0].count, 3U);
  EXPECT_EQ(columns[1].mean, 5);
}

TEST_F(ValueHistoryTest, BetweenTwoSamplesTheFirstOneStands) {
  showLevel("1", 0);
  showLevel("5", 4);
  EXPECT_THAT(outline(history.columns(number("/Cell/RSRP"), {0s, 5s}, 6)),
              ElementsAre("|1..1", "=1..1", "=1..1", "=1..1", "5..5", "-"));
}

TEST_F(ValueHistoryTest, AStretchBetweenTwoSamplesHasTheValueThatStands) {
  showLevel("1", 0);
  showLevel("5", 4);
  const auto level = number("/Cell/RSRP");
  EXPECT_THAT(outline(history.columns(level, {1s, 3s}, 2)), ElementsAre("=1..1", "=1..1"));
  EXPECT_THAT(outline(history.columns(level, {2s, 7s}, 3)), ElementsAre("=1..1", "5..5", "-"));
}

TEST_F(ValueHistoryTest, AGapLeavesItsColumnsEmpty) {
  showLevel("1", 0);
  show(dictionaryOf({}), 2);
  showLevel("5", 4);
  EXPECT_THAT(outline(history.columns(number("/Cell/RSRP"), {0s, 4s}, 5)),
              ElementsAre("|1..1", "-", "-", "-", "|5..5"));
}

TEST_F(ValueHistoryTest, AColumnIsRenewedWhenOneOfItsSamplesIs) {
  written.times["RSRP"] = noon;
  for (int i = 0; i < 4; ++i) showLevel("1", i);
  written.times["RSRP"] = noon + 4;
  showLevel("1", 4);
  const auto columns = history.columns(number("/Cell/RSRP"), {1s, 4s}, 2);
  EXPECT_FALSE(columns[0].isRenewed);
  EXPECT_TRUE(columns[1].isRenewed);
}

TEST_F(ValueHistoryTest, NoColumnsAreNoColumns) {
  showLevel("1", 0);
  EXPECT_THAT(history.columns(number("/Cell/RSRP"), history.whole(), 0), IsEmpty());
}

// ---- Bounds ----

// A display with rows of these numbers.
std::shared_ptr<const VarnelModelNode> displayOf(int firstRow, int rows) {
  Value section = Value::ofDictionary();
  for (int i = firstRow; i < firstRow + rows; ++i)
    section.dictionary()->set("Row number " + std::to_string(i), "-101.25");
  PathDictionary paths;
  return VarnelModelNode::makeTreeFromObject_withPathDictionary(dictionaryOf({{"Section", section}}), paths);
}
std::string keyOf(int row) { return "/Section/Row number " + std::to_string(row); }

// The memory that the program has allocated; 0 under the sanitizers, which have an allocator of their own.
std::size_t allocatedBytes() {
  const struct mallinfo2 info = mallinfo2();
  return info.uordblks + info.hblkhd;
}

Time second(std::int64_t number) { return {.seconds = noon + number}; }

TEST(ValueHistoryBounds, AnHourOf500RowsFitsEasily) {
  const auto display = displayOf(0, 500);
  const std::size_t before = allocatedBytes();
  ValueHistory history;
  for (int i = 0; i <= 1800; ++i) history.add(display, second(i * 2));
  // 500 × 1801 samples of 8 bytes are 7.2 MB.
  EXPECT_LE(history.bytes(), 8'500'000U);
  EXPECT_LE(allocatedBytes() - before, history.bytes());
  EXPECT_EQ(history.samples(*history.seriesOfKey(keyOf(499)), history.whole()).size(), 1801U);
  EXPECT_EQ(history.notice(), "");
}

TEST(ValueHistoryBounds, AnHourOf126RowsTakesTwoMegabytes) {
  const auto display = displayOf(0, 126);
  ValueHistory history;
  for (int i = 0; i <= 1800; ++i) history.add(display, second(i * 2));
  EXPECT_LE(history.bytes(), 2'200'000U);
}

TEST(ValueHistoryBounds, NothingEverTakesMoreThanTheLimit) {
  constexpr std::size_t limit = std::size_t{32} << 20;
  const std::size_t before = allocatedBytes();
  ValueHistory history;
  // Each display has rows that no other has.
  for (int i = 0; i < 120; ++i) {
    const auto display = displayOf(i * 1000, 1000);
    history.add(display, second(i * 2));
    ASSERT_LE(history.bytes(), limit) << i;
  }
  history.add(displayOf(0, 1), second(240));
  EXPECT_LE(allocatedBytes() - before, limit);
  EXPECT_GT(history.bytes(), limit / 10 * 9);
  EXPECT_EQ(history.notice(),
            "The courses of all values do not fit into 32 MiB: those of the values that were silent longest "
            "are gone");
}

TEST(ValueHistoryBounds, WhatWasSilentLongestGoesFirst) {
  ValueHistory history({}, {.bytes = 100'000});
  const auto often = displayOf(0, 2);
  for (int i = 1; i < 300; ++i) {
    history.add(often, second(i * 4));
    history.add(displayOf(i * 10, 1), second(i * 4 + 2));
  }
  EXPECT_LE(history.bytes(), 100'000U);
  EXPECT_FALSE(history.seriesOfKey(keyOf(10)));
  EXPECT_TRUE(history.seriesOfKey(keyOf(2990)));
  EXPECT_TRUE(history.seriesOfKey(keyOf(2980)));
  EXPECT_EQ(history.samples(*history.seriesOfKey(keyOf(0)), history.whole()).size(), 299U)
      << "silent for one generation only";
}

TEST(ValueHistoryBounds, WhenAllRowsAreOnDisplayTheOldestSamplesGo) {
  ValueHistory history({}, {.bytes = 100'000});
  const auto display = displayOf(0, 50);
  for (int i = 0; i < 1000; ++i) {
    history.add(display, second(i * 2));
    ASSERT_LE(history.bytes(), 100'000U);
  }
  EXPECT_EQ(history.series().size(), 50U);
  for (const auto number : history.series()) {
    const auto samples = history.samples(number, history.whole());
    ASSERT_FALSE(samples.empty());
    EXPECT_EQ(samples.back().at, 1998s);
  }
  EXPECT_NE(history.notice(), "");
}

TEST(ValueHistoryBounds, ADisplayThatIsTooLargeIsKeptInPart) {
  ValueHistory history({}, {.bytes = 100'000});
  const auto display = displayOf(0, 5000);
  for (int i = 0; i < 3; ++i) {
    history.add(display, second(i * 2));
    ASSERT_LE(history.bytes(), 100'000U);
  }
  EXPECT_GT(history.series().size(), 30U);
  EXPECT_NE(history.notice(), "");
}

TEST(ValueHistoryBounds, AnHourAfterTheLossNothingIsMissing) {
  ValueHistory history({}, {.bytes = 100'000});
  for (int i = 0; i < 3; ++i) history.add(displayOf(i * 100, 100), second(i * 2));
  EXPECT_NE(history.notice(), "");
  history.add(displayOf(0, 1), second(3603));
  EXPECT_NE(history.notice(), "");
  history.add(displayOf(0, 1), second(3605));
  EXPECT_EQ(history.notice(), "");
}

TEST(ValueHistoryBounds, GenerationsThatComeVeryFastAreBoundedToo) {
  ValueHistory history;
  const auto display = displayOf(0, 1);
  for (int i = 0; i < 70'000; ++i) history.add(display, {.seconds = noon, .nanoseconds = i});
  EXPECT_EQ(history.samples(*history.seriesOfKey(keyOf(0)), history.whole()).size(), 65'536U);
  EXPECT_LE(history.bytes(), 3'000'000U);
}

// Displays of any rows at any times, with the same random numbers at each run.
TEST(ValueHistoryBounds, WhateverIsShownTheSamplesStayInOrderAndTheMemoryBounded) {
  constexpr std::size_t limit = 60'000;
  std::mt19937 random(1);  // NOLINT(cert-msc51-cpp): the same numbers at each run
  const auto below = [&](unsigned end) { return static_cast<int>(random() % end); };
  ValueHistory history({}, {.length = 10min, .bytes = limit});
  std::int64_t now = 0;
  for (int i = 0; i < 2000; ++i) {
    const int kind = below(50);
    now += kind == 0 ? -below(100'000) : kind == 1 ? below(100'000) : kind == 2 ? -below(10) : below(5);
    if (below(500) == 0) history.clear();
    const auto display = displayOf(below(300), below(60));
    history.add(display, second(now));
    ASSERT_LE(history.bytes(), limit);
    const auto whole = history.whole();
    for (const auto number : history.series()) {
      const auto samples = history.samples(number, whole);
      for (std::size_t j = 1; j < samples.size(); ++j) ASSERT_LE(samples[j - 1].at, samples[j].at);
      ASSERT_TRUE(samples.empty() || (samples.front().at >= whole.begin && samples.back().at <= whole.end));
      std::size_t inColumns = 0;
      for (const auto& column : history.columns(number, whole, 7)) inColumns += column.count;
      ASSERT_EQ(inColumns, samples.size());
      ASSERT_EQ(history.summary(number, whole).count, samples.size());
    }
    for (const auto& row : *display->childNodes()->front()->childNodes()) {
      const auto number = history.seriesOf(*row);
      if (!number) continue;
      ASSERT_EQ(history.key(*number), "/Section/" + row->displayName());
      ASSERT_EQ(history.samples(*number, whole).back().at, whole.end);
    }
  }
}

TEST_F(ValueHistoryTest, ItsReadingsMakeTheSameHistoryElsewhere) {
  ValueHistory other;
  for (int i = 0; i < 3; ++i) {
    show(dictionaryOf(
             {{"Cell", dictionaryOf({{"RSRP", i == 1 ? "none" : "-85.50 dBm"}, {"RSRQ", "-9.00 dB"}})}}),
         2 * i);
    other.add(history.newestReadings(), history.timeAt(history.whole().end));
  }
  const auto number = other.seriesOfKey("/Cell/RSRP");
  ASSERT_TRUE(number);
  EXPECT_EQ(other.unit(*number), "dBm");
  EXPECT_EQ(other.name(*number), "RSRP");
  const auto kept = other.samples(*number, other.whole());
  ASSERT_EQ(kept.size(), 2U);
  EXPECT_EQ(kept[0].value, -85.5);
  EXPECT_EQ(kept[0].at, 0s);
  EXPECT_EQ(kept[1].at, 4s);
  EXPECT_TRUE(kept[1].followsGap);
  EXPECT_EQ(other.samples(*other.seriesOfKey("/Cell/RSRQ"), other.whole()).size(), 3U);
}

TEST_F(ValueHistoryTest, AReadingWhoseNameIsNotInItsKeyIsLeftOut) {
  const ValueHistory::Reading reading{"/A", 1, 5, "", *StoredSample::ofNumber("1")};
  history.add(std::vector{reading}, {.seconds = noon});
  EXPECT_THAT(history.series(), IsEmpty());
}

TEST_F(ValueHistoryTest, OfSeveralReadingsOfOneSeriesTheFirstCounts) {
  const ValueHistory::Reading one{"/A", 1, 1, "", *StoredSample::ofNumber("1")};
  const ValueHistory::Reading two{"/A", 1, 1, "", *StoredSample::ofNumber("2")};
  history.add(std::vector{one, two}, {.seconds = noon});
  ASSERT_EQ(samples("/A").size(), 1U);
  EXPECT_EQ(samples("/A")[0].value, 1);
}

TEST_F(ValueHistoryTest, TheClockHasAPieceForEachTimeThatItWasSet) {
  showLevel("-85.00 dBm", 0);
  showLevel("-85.00 dBm", 2);
  showLevel("-85.00 dBm", -3600);
  showLevel("-85.00 dBm", -3598);
  const auto pieces = history.clockPieces(history.whole());
  ASSERT_EQ(pieces.size(), 2U);
  EXPECT_EQ(pieces[0].stretch.end, 2s);
  EXPECT_EQ(pieces[0].time, (Time{.seconds = noon}));
  EXPECT_EQ(pieces[1].stretch.begin, 2s);
  EXPECT_EQ(pieces[1].stretch.end, 4s);
  EXPECT_EQ(pieces[1].time, (Time{.seconds = noon - 3600}));
}

TEST_F(ValueHistoryTest, AStretchBeforeTheHistoryHasThePieceOfItsBeginning) {
  EXPECT_TRUE(history.clockPieces({0s, 1s}).empty());
  showLevel("-85.00 dBm", 0);
  const auto pieces = history.clockPieces({-60s, 0s});
  ASSERT_EQ(pieces.size(), 1U);
  EXPECT_EQ(pieces[0].time, (Time{.seconds = noon - 60}));
}

TEST_F(ValueHistoryTest, ATimeHasItsPointOnTheAxis) {
  EXPECT_FALSE(history.pointAt({.seconds = noon}));
  showLevel("-85.00 dBm", 0);
  showLevel("-85.00 dBm", 4);
  EXPECT_EQ(history.pointAt({.seconds = noon + 3}), 3s);
  EXPECT_EQ(history.pointAt({.seconds = noon + 9}), 9s);
  EXPECT_FALSE(history.pointAt({.seconds = noon - 1}));
  EXPECT_FALSE(history.pointAt({.seconds = noon + 60}));
}

}  // namespace
}  // namespace varnel
