#include "LogGenerator/Section.h"

#include <gtest/gtest.h>

#include <limits>

#include "tests/support/Describe.h"

namespace varnel {
namespace {

constexpr Time noon{.seconds = 1'700'000'000};
constexpr Time later{.seconds = 1'700'000'002, .nanoseconds = 5};

constexpr Field levels[] = {{u8(0), "RSRP", integer("%d dBm", -1)}, {u8(1), "Cell ID"}};
constexpr Field identity[] = {{u8(0), "Cell ID"}, {u8(1), "Band"}};

class SectionTest : public testing::Test {
 protected:
  void show(const Bytes& bytes, std::span<const Field> fields) { section.show(Packet(bytes), fields); }
  std::string shown() const { return described(container); }

  const Value container = Value::ofDictionary();
  const Value list = Value::ofArray({"old"});
  Section section;
};

TEST_F(SectionTest, ShowsTheFieldsOfATableInItsOrder) {
  section.bind(container);
  show({80, 7}, levels);
  EXPECT_EQ(shown(), R"({RSRP: "-80 dBm", Cell ID: "7"})");
  show({81, 8}, levels);
  EXPECT_EQ(shown(), R"({RSRP: "-81 dBm", Cell ID: "8"})");
}

TEST_F(SectionTest, TablesMayHaveAnEntryInCommon) {
  section.bind(container);
  show({80, 7}, levels);
  show({9, 3}, identity);
  EXPECT_EQ(shown(), R"({RSRP: "-80 dBm", Cell ID: "9", Band: "3"})");
  show({82, 7}, levels);
  EXPECT_EQ(shown(), R"({RSRP: "-82 dBm", Cell ID: "7", Band: "3"})");
}

TEST_F(SectionTest, ShowsNumbersTextsAndValuesByName) {
  section.bind(container);
  section.setText("State", "Idle");
  section.setInteger("RSSI", integer("%d dBm", 2), -7);
  section.setReal("Mean", real("%4.2f dBm"), std::numeric_limits<double>::quiet_NaN());
  section.set("ARFCNs", Value::ofArray({"62"}));
  section.set("Absent", Value());
  EXPECT_EQ(shown(), R"({State: "Idle", RSSI: "-14 dBm", Mean: " nan dBm", ARFCNs: ["62"]})");
}

TEST_F(SectionTest, AnEntryThatWasRemovedComesBackAtTheEnd) {
  section.bind(container);
  show({80, 7}, levels);
  section.remove("RSRP");
  section.remove("RSRP");
  EXPECT_EQ(shown(), R"({Cell ID: "7"})");
  show({81, 8}, levels);
  EXPECT_EQ(shown(), R"({Cell ID: "8", RSRP: "-81 dBm"})");
}

TEST_F(SectionTest, EntriesAreFoundWhereverOthersHavePutThem) {
  section.bind(container);
  show({80, 7}, levels);
  *container.dictionary() = {};
  container.dictionary()->set("Cell ID", "other");
  show({81, 8}, levels);
  EXPECT_EQ(shown(), R"({Cell ID: "8", RSRP: "-81 dBm"})");
}

TEST_F(SectionTest, WithoutAContainerNothingIsShownAnywhere) {
  show({80, 7}, levels);
  section.setText("State", "Idle");
  section.remove("State");
  section.refill([](Array& records) { records.emplace_back("unseen"); });
  EXPECT_TRUE(section.container().isAbsent());
}

TEST_F(SectionTest, AContainerOfTheOtherKindIsLeftAlone) {
  section.bind(list);
  show({80, 7}, levels);
  section.set("State", "Idle");
  EXPECT_EQ(described(list), R"(["old"])");
  section.bind(container);
  section.refill([](Array& records) { records.emplace_back("unseen"); });
  EXPECT_EQ(shown(), "{}");
}

TEST_F(SectionTest, RefillEmptiesTheListAndHasItFilled) {
  section.bind(list);
  section.refill([](Array& records) {
    EXPECT_TRUE(records.empty());
    records = {"1", "2"};
  });
  EXPECT_EQ(described(list), R"(["1", "2"])");
  section.refill([](Array& /*records*/) {});
  EXPECT_EQ(described(list), "[]");
}

TEST_F(SectionTest, AnEntryRemembersWhenItWasWritten) {
  section.bind(container);
  EXPECT_FALSE(section.writtenAt("RSRP"));
  section.setTime(noon);
  show({80, 7}, levels);
  section.setText("State", "Idle");
  section.setTime(later);
  show({9, 3}, identity);
  EXPECT_EQ(section.writtenAt("RSRP"), noon);
  EXPECT_EQ(section.writtenAt("State"), noon);
  EXPECT_EQ(section.writtenAt("Cell ID"), later);
  EXPECT_EQ(section.writtenAt("Band"), later);
  EXPECT_FALSE(section.writtenAt("Other"));
}

TEST_F(SectionTest, AListRemembersWhenItWasRefilled) {
  section.bind(list);
  EXPECT_FALSE(section.refilledAt());
  section.setTime(noon);
  section.refill([](Array& /*records*/) {});
  EXPECT_EQ(section.refilledAt(), noon);
}

TEST_F(SectionTest, ANewContainerHasNotBeenWritten) {
  section.bind(container);
  section.setTime(noon);
  section.setText("State", "Idle");
  section.bind(Value::ofDictionary());
  EXPECT_FALSE(section.writtenAt("State"));
}

}  // namespace
}  // namespace varnel
