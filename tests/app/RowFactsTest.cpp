#include "app/RowFacts.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "LogGenerator/Field.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using Display = RowFacts::Display;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

constexpr std::int64_t start = 1700000000;

// Every leaf was written at this moment.
struct WrittenAt final : WriteTimes {
  explicit WrittenAt(std::int64_t second) : second(second) {}
  std::optional<Time> writtenAt(const Dictionary&, std::string_view) const override {
    return Time{second, 0};
  }
  std::optional<Time> refilledAt(const Array&) const override { return Time{second, 0}; }
  std::int64_t second;
};

class RowFactsTest : public testing::Test {
 protected:
  RowFactsTest() {
    const Value rows = dictionaryOf(
        {{"RSRP",
          dictionaryOf({{"Meaning", "How strong the cell is."}, {"Unit", "dBm"}, {"Level", "Power"}})},
         {"Cell", "The cell that serves the phone."}});
    const Value limits = dictionaryOf({{"Fair", Value::ofInteger(-100)},
                                       {"Good", Value::ofInteger(-90)},
                                       {"Excellent", Value::ofInteger(-80)},
                                       {"Highest", Value::ofInteger(0)}});
    host.resources.add("Explanations",
                       dictionaryOf({{"Rows", rows}, {"Levels", dictionaryOf({{"Power", limits}})}}));
    host.clock.set({start, 0});
    NumberFormats formats;
    formats.add("Cell", "RSRP", real("%.1f dBm"));
    formats.add("Cells", "RSRP", real("%.1f dBm"));
    facts.setFormats(formats);
    history.setFormats(formats);
  }

  void follow(const std::string& level, std::int64_t written = start, Display display = Display::Renewed) {
    const Value neighbor = dictionaryOf({{"EARFCN", "1300"}, {"Physical Cell ID", "16"}, {"RSRP", level}});
    const Value content =
        dictionaryOf({{"Cell", dictionaryOf({{"RSRP", level}, {"Band", "3"}})},
                      {"Neighbors", dictionaryOf({{"Cells", Value::ofArray({neighbor})}})}});
    PathDictionary paths;
    tree = VarnelModelNode::makeTreeFromObject_withPathDictionary(content, paths, WrittenAt(written));
    history.add(tree, host.clock.now());
    facts.follow(tree, display);
  }
  RowFacts::Row row(const NamePath& path) {
    namesOfPane.assign(path.begin(), path.end() - 1);
    return {*nodeUnderNames(*tree, path), *nodeUnderNames(*tree, namesOfPane), namesOfPane};
  }
  CellFacts of(const NamePath& path) { return facts.of(row(path)); }

  TestServices host;
  ValueHistory history;
  RowAnswers answers{host.resources, host.clock, history};
  RowFacts facts{{host.clock, &history, &answers}};
  RowFacts::Node tree;
  NamePath namesOfPane;
};

TEST_F(RowFactsTest, ALevelIsThatOfTheLimits) {
  follow("-84.0 dBm");
  EXPECT_EQ(of({"Cell", "RSRP"}).level, CellLevel::Good);
  EXPECT_EQ(of({"Cell", "Band"}).level, CellLevel::None);
  EXPECT_EQ(of({"Cell"}).level, CellLevel::None);
  follow("-80.0 dBm");
  EXPECT_EQ(of({"Cell", "RSRP"}).level, CellLevel::Excellent);
  follow("-100.0 dBm");
  EXPECT_EQ(of({"Cell", "RSRP"}).level, CellLevel::Fair);
  follow("-100.1 dBm");
  EXPECT_EQ(of({"Cell", "RSRP"}).level, CellLevel::Poor);
}

TEST_F(RowFactsTest, ATextThatIsNoNumberHasNoLevel) {
  for (const char* text : {"", "Not Present"}) {
    follow(text);
    EXPECT_EQ(of({"Cell", "RSRP"}).level, CellLevel::None) << text;
  }
}

TEST_F(RowFactsTest, ARecordHasASummaryAndTheLevelInIt) {
  follow("-84.0 dBm");
  const CellFacts record = of({"Neighbors", "Cells", "0"});
  EXPECT_THAT(record.summary, ElementsAre("EARFCN 1300, PCI 16", "\u221284.0 dBm"));
  EXPECT_EQ(record.level, CellLevel::Good);
  EXPECT_THAT(of({"Neighbors", "Cells"}).summary, IsEmpty()) << "it is no record";
  EXPECT_THAT(of({"Neighbors", "Cells", "0", "RSRP"}).summary, IsEmpty());
}

TEST_F(RowFactsTest, WhatTheLastRefreshChangedIsMarked) {
  follow("-84.0 dBm");
  EXPECT_EQ(of({"Cell", "RSRP"}).change, CellChange::None);
  follow("-85.0 dBm");
  EXPECT_EQ(of({"Cell", "RSRP"}).change, CellChange::Changed);
  EXPECT_EQ(of({"Cell", "Band"}).change, CellChange::None);
  follow("-85.0 dBm");
  EXPECT_EQ(of({"Cell", "RSRP"}).change, CellChange::None);
}

TEST_F(RowFactsTest, ANumberHasACourse) {
  follow("-84.0 dBm");
  EXPECT_THAT(of({"Cell", "RSRP"}).course, SizeIs(24));
  EXPECT_THAT(of({"Cell"}).course, IsEmpty());
}

TEST_F(RowFactsTest, AnIdentityHasNoCourseThoughItsTrendCanBeAskedFor) {
  follow("-84.0 dBm");
  for (const NamePath& path : {NamePath{"Cell", "Band"}, NamePath{"Neighbors", "Cells", "0", "EARFCN"},
                               NamePath{"Neighbors", "Cells", "0", "Physical Cell ID"}}) {
    EXPECT_THAT(of(path).course, IsEmpty()) << path.back();
    EXPECT_TRUE(history.seriesOf(row(path).node)) << path.back();
  }
  EXPECT_THAT(of({"Neighbors", "Cells", "0", "RSRP"}).course, SizeIs(24));
}

TEST_F(RowFactsTest, AValueOfAMinuteIsDimmed) {
  follow("-84.0 dBm");
  host.clock.set({start + 59, 999'999'999});
  EXPECT_EQ(of({"Cell", "RSRP"}).dimming, CellDimming::None);
  EXPECT_EQ(of({"Neighbors", "Cells", "0"}).dimming, CellDimming::None);
  host.clock.set({start + 60, 0});
  EXPECT_EQ(of({"Cell", "RSRP"}).dimming, CellDimming::Value);
  EXPECT_EQ(of({"Neighbors", "Cells", "0"}).dimming, CellDimming::Value);
  EXPECT_EQ(of({"Cell"}).dimming, CellDimming::None) << "a section shows no value";
}

TEST_F(RowFactsTest, AValueOfBeforeTheClockWasSetFarBackIsDimmedUntilItComesAgain) {
  follow("-84.0 dBm");
  host.clock.set({start - 3600, 0});
  EXPECT_EQ(of({"Cell", "RSRP"}).dimming, CellDimming::Value);
  host.clock.set({start - 1, 0});
  EXPECT_EQ(of({"Cell", "RSRP"}).dimming, CellDimming::None) << "a small step";
  host.clock.set({start - 3600, 0});
  follow("-85.0 dBm", start - 3600);
  EXPECT_EQ(of({"Cell", "RSRP"}).dimming, CellDimming::None);
}

TEST_F(RowFactsTest, OfADisplayThatStandsStillEverythingIsDimmed) {
  follow("-84.0 dBm", start, Display::Standing);
  EXPECT_EQ(of({"Cell", "RSRP"}).dimming, CellDimming::All);
  EXPECT_EQ(of({"Cell"}).dimming, CellDimming::All);
}

TEST_F(RowFactsTest, ChangeWhenTheDisplayBeginsOrEndsToStandStill) {
  follow("-84.0 dBm");
  EXPECT_FALSE(facts.haveChanged(Display::Renewed));
  EXPECT_TRUE(facts.haveChanged(Display::Standing));
  EXPECT_FALSE(facts.haveChanged(Display::Standing));
  EXPECT_TRUE(facts.haveChanged(Display::Renewed));
}

TEST_F(RowFactsTest, ChangeWhenAShownValueBecomesOld) {
  follow("-84.0 dBm");
  host.clock.set({start + 60, 0});
  EXPECT_FALSE(facts.haveChanged(Display::Renewed)) << "no row was shown";
  host.clock.set({start + 10, 0});
  of({"Cell", "RSRP"});
  EXPECT_FALSE(facts.haveChanged(Display::Renewed));
  host.clock.set({start + 60, 0});
  EXPECT_TRUE(facts.haveChanged(Display::Renewed));
  of({"Cell", "RSRP"});
  EXPECT_FALSE(facts.haveChanged(Display::Renewed)) << "it is old already";
}

TEST_F(RowFactsTest, CoursesThatAreKnownElsewhereReplaceThoseOfTheHistory) {
  struct Elsewhere final : RowCourses {
    std::vector<std::optional<double>> course(const VarnelModelNode&) const override { return {-90, -80}; }
    unsigned edition() const override { return number; }
    unsigned number = 0;
  } elsewhere;
  RowFacts knowing({host.clock, &history, &answers, &elsewhere});
  follow("-84.0 dBm");
  knowing.follow(tree, Display::Renewed);
  EXPECT_THAT(knowing.of(row({"Cell", "RSRP"})).course, ElementsAre(-90, -80));
  EXPECT_THAT(knowing.of(row({"Cell", "Band"})).course, IsEmpty()) << "an identity";
  EXPECT_FALSE(knowing.haveChanged(Display::Renewed));
  elsewhere.number = 1;
  EXPECT_TRUE(knowing.haveChanged(Display::Renewed));
  EXPECT_FALSE(knowing.haveChanged(Display::Renewed));
}

TEST_F(RowFactsTest, AnExplanationTellsMeaningLevelAgeAndChange) {
  follow("-84.0 dBm");
  follow("-85.0 dBm");
  host.clock.set({start + 125, 0});
  EXPECT_EQ(facts.explanation(row({"Cell", "RSRP"})),
            "How strong the cell is.\n"
            "Level: good\n"
            "The modem sent it 2 minutes ago.\n"
            "It changed with the last refresh.");
  EXPECT_EQ(facts.explanation(row({"Cell", "Band"})), "The modem sent it 2 minutes ago.");
  follow("-85.0 dBm");
  EXPECT_EQ(facts.explanation(row({"Cell"})), "The cell that serves the phone.");
  EXPECT_EQ(facts.explanation(row({"Neighbors"})), "");
}

TEST_F(RowFactsTest, OtherFormatsCountFromThenOn) {
  follow("-84.0 dBm");
  EXPECT_EQ(of({"Cell", "RSRP"}).level, CellLevel::Good);
  NumberFormats formats;
  formats.add("Cell", "RSRP", real("%.1f dBuV"));
  facts.setFormats(formats);
  EXPECT_EQ(of({"Cell", "RSRP"}).level, CellLevel::None);
}

TEST_F(RowFactsTest, WithoutAnswersThereAreOnlyChangesAndCourses) {
  RowFacts plain({host.clock, &history});
  follow("-84.0 dBm");
  plain.follow(tree, Display::Standing);
  const CellFacts shown = plain.of(row({"Cell", "RSRP"}));
  EXPECT_EQ(shown.level, CellLevel::None);
  EXPECT_EQ(shown.dimming, CellDimming::None);
  EXPECT_THAT(shown.course, SizeIs(24));
  EXPECT_THAT(plain.of(row({"Neighbors", "Cells", "0"})).summary, IsEmpty());
  EXPECT_EQ(plain.explanation(row({"Cell", "RSRP"})), "");
}

}  // namespace
}  // namespace varnel
