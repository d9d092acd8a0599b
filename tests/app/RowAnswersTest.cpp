#include "app/RowAnswers.h"

#include <gtest/gtest.h>

#include "LogGenerator/Field.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

class RowAnswersTest : public testing::Test {
 protected:
  RowAnswersTest() {
    const Value rows = dictionaryOf(
        {{"Level",
          dictionaryOf({{"Meaning", "How strong the cell is."}, {"Unit", "dBm"}, {"Level", "Power"}})},
         {"Cell", "The cell that serves the phone."}});
    const Value limits = dictionaryOf({{"Fair", Value::ofInteger(-100)},
                                       {"Good", Value::ofInteger(-90)},
                                       {"Excellent", Value::ofInteger(-80)},
                                       {"Highest", Value::ofInteger(0)}});
    host.resources.add("Explanations",
                       dictionaryOf({{"Rows", rows}, {"Levels", dictionaryOf({{"Power", limits}})}}));
    host.clock.setZone({3600, false});
    NumberFormats formats;
    formats.add("Cell", "Level", real("%.1f dBm"));
    history.setFormats(formats);
    tree = VarnelModelNode::makeTreeFromObject_withPathDictionary(
        dictionaryOf({{"Cell", dictionaryOf({{"Level", "-84.0 dBm"}, {"Name", "a\x1b[2Jcell"}})}}), paths,
        AllWritten());
    history.add(tree, {1700000000, 0});
  }

  struct AllWritten final : WriteTimes {
    std::optional<Time> writtenAt(const Dictionary&, std::string_view) const override {
      return Time{1700000000, 0};
    }
  };

  const VarnelModelNode& row(const NamePath& names) const { return *nodeUnderNames(*tree, names); }
  std::string everything(const NamePath& names) const { return answers.everything(row(names), names); }

  TestServices host;
  ValueHistory history;
  PathDictionary paths;
  std::shared_ptr<const VarnelModelNode> tree;
  RowAnswers answers{host.resources, host.clock, history};
};

TEST_F(RowAnswersTest, AnExplanationTellsWhatIsKnown) {
  host.clock.set({1700000001, 0});
  const auto explanation = [this](const NamePath& names, const std::optional<SignalLevel>& level = {}) {
    return answers.explanation(row(names), RowAnswers::pathOf(names), level);
  };
  EXPECT_EQ(explanation({"Cell", "Level"}, SignalLevel::Good),
            "How strong the cell is.\nLevel: good\nThe modem sent it 1 second ago.");
  EXPECT_EQ(explanation({"Cell", "Name"}), "The modem sent it 1 second ago.");
  EXPECT_EQ(explanation({"Cell"}), "The cell that serves the phone.");
}

TEST_F(RowAnswersTest, AnAgeIsInTheLargestUnitThatFits) {
  const auto age = [this](std::int64_t seconds) {
    host.clock.set({1700000000 + seconds, 999'999'999});
    return answers.explanation(row({"Cell", "Name"}), "/Cell/Name", {});
  };
  EXPECT_EQ(age(-1), "The modem has just sent it.");
  EXPECT_EQ(age(0), "The modem has just sent it.");
  EXPECT_EQ(age(59), "The modem sent it 59 seconds ago.");
  EXPECT_EQ(age(60), "The modem sent it 1 minute ago.");
  EXPECT_EQ(age(7200), "The modem sent it 2 hours ago.");
  EXPECT_EQ(age(86400), "The modem sent it 1 day ago.");
}

TEST_F(RowAnswersTest, OfALevelTellValueGradeTimeAndMeaning) {
  EXPECT_EQ(
      everything({"Cell", "Level"}),
      "This row: Cell > Level\n"
      "Its value: -84.0 dBm (good)\n"
      "The modem last sent it 2023-11-14 at 23:13:20.\n"
      "How strong the cell is.\n"
      "Unit: dBm\n"
      "Levels: poor below -100 dBm, fair from there, good from -90 dBm, excellent from -80 dBm (a rule of "
      "thumb, not a standard)\n");
}

TEST_F(RowAnswersTest, OfATextTellItWithoutControlCharacters) {
  EXPECT_EQ(everything({"Cell", "Name"}),
            "This row: Cell > Name\n"
            "Its value: a\\x1b[2Jcell\n"
            "The modem last sent it 2023-11-14 at 23:13:20.\n");
}

TEST_F(RowAnswersTest, OfASectionTellItsMeaningAndHowManyRowsItHas) {
  EXPECT_EQ(everything({"Cell"}),
            "This row: Cell\n"
            "The cell that serves the phone.\n"
            "It leads to 2 rows; Enter opens them.\n");
  EXPECT_EQ(answers.age(row({"Cell"})), "");
}

TEST_F(RowAnswersTest, OnlyALevelIsGraded) {
  EXPECT_EQ(answers.level(row({"Cell", "Level"}), "/Cell/Level"), SignalLevel::Good);
  EXPECT_EQ(answers.level(row({"Cell", "Name"}), "/Cell/Name"), std::nullopt);
}

TEST_F(RowAnswersTest, OnlyANumberHasACourse) {
  const auto course = answers.course(row({"Cell", "Level"}), {"Cell", "Level"});
  ASSERT_TRUE(course);
  EXPECT_EQ(course->title, "Cell > Level");
  EXPECT_EQ(history.summary(course->number, history.last({})).last, -84);
  EXPECT_FALSE(answers.course(row({"Cell", "Name"}), {"Cell", "Name"}));
}

TEST_F(RowAnswersTest, TheResourceIsReadOnce) {
  answers.meaning("/Cell");
  answers.meaning("/Cell/Level");
  EXPECT_EQ(host.resources.requests().size(), 1u);
}

}  // namespace
}  // namespace varnel
