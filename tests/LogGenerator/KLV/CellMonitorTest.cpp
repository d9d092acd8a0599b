#include "LogGenerator/KLV/CellMonitor.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <limits>

#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* failedParse = "<3>Cell Info Array data could not be constructed";

// What is read of a message: the array in one line, or nothing.
std::string read(const Bytes& message) {
  const std::optional<Value> records = readCellMonitorArray(Packet(message));
  return records ? described(*records) : "nothing";
}

TEST(CellMonitor, ReadsTheArrayBehindTheHeader) {
  RecordingLog log;
  const Value list =
      Value::ofArray({dictionaryOf({{"MCC", Value::ofInteger(262)}, {"CellType", "Serving"}})});
  EXPECT_EQ(read(serverMessage(0xFF0001, list)), R"([{MCC: 262, CellType: "Serving"}])");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST(CellMonitor, ReadsXmlAsWell) {
  EXPECT_EQ(read(serverMessageOfText(0xFF0001,
                                     "<plist version=\"1.0\"><array><dict><key>LAC</key>"
                                     "<integer>-7</integer></dict></array></plist>")),
            "[{LAC: -7}]");
}

TEST(CellMonitor, TheHeaderIsNotInterpreted) {
  Bytes message = serverMessage(0xFF0001, Value::ofArray());
  for (std::size_t offset = 0; offset < 13; ++offset) message[offset] = 0x81;
  EXPECT_EQ(read(message), "[]");
}

TEST(CellMonitor, KeepsElementsOfAnyKind) {
  EXPECT_EQ(read(serverMessage(0xFF0001, Value::ofArray({"text", Value::ofBoolean(true), Value::ofArray()}))),
            R"(["text", true, []])");
}

TEST(CellMonitor, WhatIsNoPropertyListGivesNothingAndOneLine) {
  RecordingLog log;
  EXPECT_EQ(read(serverMessageOfText(0xFF0001, "no property list")), "nothing");
  EXPECT_THAT(log.takeTexts(), ElementsAre(failedParse));
}

TEST(CellMonitor, AListWithAnotherRootThanAnArrayIsAFailedParse) {
  RecordingLog log;
  const Value roots[] = {dictionaryOf({{"RadioAccessTechnology", "LTE"}}), "text", Value::ofInteger(1),
                         Value::ofBoolean(true)};
  for (const Value& root : roots) {
    EXPECT_EQ(read(serverMessage(0xFF0001, root)), "nothing") << described(root);
    EXPECT_THAT(log.takeTexts(), ElementsAre(failedParse)) << described(root);
  }
}

TEST(CellMonitor, AHeaderAloneOrLessIsAFailedParse) {
  for (std::size_t size = 0; size <= 13; ++size) {
    RecordingLog log;
    EXPECT_EQ(read(Bytes(size)), "nothing") << size << " bytes";
    EXPECT_THAT(log.takeTexts(), ElementsAre(failedParse)) << size << " bytes";
  }
}

TEST(CellMonitor, ARecordOfTheGivenKindIsADictionaryWithBothEntries) {
  const Value record = dictionaryOf({{"CellType", "Serving"}, {"RadioAccessTechnology", "LTE"}});
  EXPECT_EQ(cellOfKind(record, "LTE", "Serving"), record.dictionary());
}

TEST(CellMonitor, ARecordOfAnotherKindIsNone) {
  const Value record = dictionaryOf({{"CellType", "Serving"}, {"RadioAccessTechnology", "LTE"}});
  EXPECT_EQ(cellOfKind(record, "GSM", "Serving"), nullptr);
  EXPECT_EQ(cellOfKind(record, "LTE", "Neighbor"), nullptr);
  EXPECT_EQ(cellOfKind(record, "lte", "Serving"), nullptr);
  EXPECT_EQ(cellOfKind(record, "Serving", "LTE"), nullptr);
}

TEST(CellMonitor, ARecordThatLacksEitherEntryIsNone) {
  EXPECT_EQ(cellOfKind(dictionaryOf({{"CellType", "Serving"}}), "LTE", "Serving"), nullptr);
  EXPECT_EQ(cellOfKind(dictionaryOf({{"RadioAccessTechnology", "LTE"}}), "LTE", "Serving"), nullptr);
  EXPECT_EQ(cellOfKind(Value::ofDictionary(), "LTE", "Serving"), nullptr);
}

TEST(CellMonitor, ARecordWhoseEntriesAreNoTextsIsNone) {
  const Value number =
      dictionaryOf({{"RadioAccessTechnology", Value::ofInteger(3)}, {"CellType", "Serving"}});
  EXPECT_EQ(cellOfKind(number, "LTE", "Serving"), nullptr);
  const Value list =
      dictionaryOf({{"RadioAccessTechnology", "LTE"}, {"CellType", Value::ofArray({"Serving"})}});
  EXPECT_EQ(cellOfKind(list, "LTE", "Serving"), nullptr);
}

TEST(CellMonitor, WhatIsNoDictionaryIsNoRecord) {
  EXPECT_EQ(cellOfKind(Value(), "LTE", "Serving"), nullptr);
  EXPECT_EQ(cellOfKind("LTE", "LTE", "Serving"), nullptr);
  EXPECT_EQ(cellOfKind(Value::ofArray({"LTE", "Serving"}), "LTE", "Serving"), nullptr);
}

// What a record with this number shows in a section whose entry held "before".
std::string shownNumber(const Value& number) {
  static constexpr CellMonitorEntry entries[] = {{"LAC", "Location Area Code", "Failed to retrieve LAC\n"}};
  const Value shown = dictionaryOf({{"Location Area Code", "before"}});
  Section section;
  section.bind(shown);
  Dictionary cell;
  cell.set("LAC", number);
  showCell(section, cell, entries);
  return *shown.dictionary()->get("Location Area Code").string();
}

TEST(CellMonitor, IntegersAreShownAsDecimals) {
  EXPECT_EQ(shownNumber(Value::ofInteger(0)), "0");
  EXPECT_EQ(shownNumber(Value::ofInteger(-7)), "-7");
  EXPECT_EQ(shownNumber(Value::ofInteger(2147483647)), "2147483647");
  EXPECT_EQ(shownNumber(Value::ofInteger(-2147483648)), "-2147483648");
}

TEST(CellMonitor, IntegersOf64BitsWrapTo32) {
  EXPECT_EQ(shownNumber(Value::ofInteger(2147483648)), "-2147483648");
  EXPECT_EQ(shownNumber(Value::ofInteger(4294967295)), "-1");
  EXPECT_EQ(shownNumber(Value::ofInteger(4294967301)), "5");
  EXPECT_EQ(shownNumber(Value::ofInteger(-2147483649)), "2147483647");
  EXPECT_EQ(shownNumber(Value::ofInteger(std::numeric_limits<std::int64_t>::min())), "0");
}

TEST(CellMonitor, RealsAreTruncatedTowardsZeroAndWrap) {
  EXPECT_EQ(shownNumber(Value::ofReal(1.9)), "1");
  EXPECT_EQ(shownNumber(Value::ofReal(-1.9)), "-1");
  EXPECT_EQ(shownNumber(Value::ofReal(-0.5)), "0");
  EXPECT_EQ(shownNumber(Value::ofReal(3000000000.75)), "-1294967296");
  EXPECT_EQ(shownNumber(Value::ofReal(4294967301.5)), "5");
  EXPECT_EQ(shownNumber(Value::ofReal(-4294967301.5)), "-5");
  EXPECT_EQ(shownNumber(Value::ofReal(1e300)), "0");
}

TEST(CellMonitor, RealsThatAreNotFiniteAreZero) {
  EXPECT_EQ(shownNumber(Value::ofReal(std::numeric_limits<double>::infinity())), "0");
  EXPECT_EQ(shownNumber(Value::ofReal(-std::numeric_limits<double>::infinity())), "0");
  EXPECT_EQ(shownNumber(Value::ofReal(std::numeric_limits<double>::quiet_NaN())), "0");
}

TEST(CellMonitor, WhatIsNoNumberLeavesTheEntryAndIsReported) {
  const Value values[] = {Value(),          Value::ofBoolean(true), "12",
                          Value::ofArray(), Value::ofDictionary(),  Value::ofData({1})};
  for (const Value& value : values) {
    RecordingLog log;
    EXPECT_EQ(shownNumber(value), "before") << described(value);
    EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Failed to retrieve LAC\n")) << described(value);
  }
}

TEST(CellMonitor, EachEntryOfTheTableIsTriedInOrder) {
  static constexpr CellMonitorEntry entries[] = {
      {"C", "Third", "no C"}, {"A", "First", "no A"}, {"X", "None", "no X\n"}, {"B", "Second", "no B"}};
  RecordingLog log;
  const Value shown = Value::ofDictionary();
  Section section;
  section.bind(shown);
  const Value cell =
      dictionaryOf({{"A", Value::ofInteger(1)}, {"B", Value::ofInteger(2)}, {"D", Value::ofInteger(4)}});
  showCell(section, *cell.dictionary(), entries);
  EXPECT_EQ(described(shown), R"({First: "1", Second: "2"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre("<3>no C", "<3>no X\n"));
}

TEST(CellMonitorReader, EveryReadOfAPacketGivesItsRecords) {
  RecordingLog log;
  CellMonitorReader reader;
  const Bytes first = serverMessage(0xFF0001, Value::ofArray({"first"}));
  const Bytes second = serverMessage(0xFF0001, Value::ofArray({"second"}));
  for (int i = 0; i < 2; ++i) {
    EXPECT_EQ(described(Value::ofArray(*reader.read(Packet(first)))), R"(["first"])");
    EXPECT_EQ(described(Value::ofArray(*reader.read(Packet(first)))), R"(["first"])");
    EXPECT_EQ(described(Value::ofArray(*reader.read(Packet(second)))), R"(["second"])");
  }
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST(CellMonitorReader, APacketIsKnownByItsBytesNotByItsPlace) {
  CellMonitorReader reader;
  Bytes message = serverMessage(0xFF0001, Value::ofArray({"here"}));
  reader.read(Packet(message));
  const Bytes other = serverMessage(0xFF0001, Value::ofArray({"gone"}));
  ASSERT_EQ(other.size(), message.size());
  std::ranges::copy(other, message.begin());
  EXPECT_EQ(described(Value::ofArray(*reader.read(Packet(message)))), R"(["gone"])");
}

TEST(CellMonitorReader, EachReadOfAFailedParseLogsBothLines) {
  RecordingLog log;
  CellMonitorReader reader;
  const Bytes broken = serverMessageOfText(0xFF0001, "no property list");
  for (int i = 0; i < 2; ++i) {
    EXPECT_EQ(reader.read(Packet(broken)), nullptr);
    EXPECT_THAT(log.takeTexts(), ElementsAre(failedParse, "<3>Failed to get Cell Array\n"));
  }
}

TEST(CellMonitorReader, AMessageWithoutAPayloadIsAFailedParseAtOnce) {
  RecordingLog log;
  CellMonitorReader reader;
  EXPECT_EQ(reader.read(Packet(Bytes(13))), nullptr);
  EXPECT_THAT(log.takeTexts(), ElementsAre(failedParse, "<3>Failed to get Cell Array\n"));
}

}  // namespace
}  // namespace varnel
