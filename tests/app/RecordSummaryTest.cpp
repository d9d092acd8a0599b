#include "app/RecordSummary.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// Reads "-84.25 dBm" and "-9 dB" as good levels, and nothing else.
std::optional<RecordSummaries::Level> levelIn(const VarnelModelNode& leaf) {
  const std::string_view text = *leaf.value();
  const std::size_t blank = text.find(' ');
  if (blank == std::string_view::npos || !text.substr(blank).starts_with(" dB")) return std::nullopt;
  return RecordSummaries::Level{text.substr(0, blank), text.substr(blank + 1), SignalLevel::Good};
}

// The summary of the first record of this list, which is in a display with these other sections.
RecordSummary summaryIn(std::string_view list, std::initializer_list<Value> records,
                        std::initializer_list<Dictionary::Entry> others = {}) {
  Value display = dictionaryOf(others);
  const Value array = Value::ofArray();
  for (const Value& record : records) array.array()->push_back(record);
  display.dictionary()->set(list, array);
  PathDictionary paths;
  const auto root = VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
  const auto& itsList = *paths.at("/" + std::string(list));
  return RecordSummaries(itsList, *root).of(*itsList.childNodes()->front(), levelIn);
}

Value cell(const char* channel, const char* number) {
  return dictionaryOf(
      {{"EARFCN", channel}, {"Physical Cell ID", number}, {"RSRP", "-84.04 dBm"}, {"RSRQ", "-9.00 dB"}});
}

TEST(RecordSummary, OfACellIsItsIdentityAndItsLevelsWithOneDecimal) {
  const RecordSummary summary = summaryIn("Cells", {cell("1300", "16"), cell("1450", "16")});
  EXPECT_THAT(summary.parts, ElementsAre("EARFCN 1300, PCI 16", "\u221284.0 dBm", "\u22129.0 dB"));
  EXPECT_EQ(summary.level, SignalLevel::Good);
}

TEST(RecordSummary, WhatTheIdentitiesOfAllRecordsBeginWithIsLeftOut) {
  EXPECT_THAT(summaryIn("Cells", {cell("1300", "16"), cell("1300", "160")}).parts,
              ElementsAre("PCI 16", "\u221284.0 dBm", "\u22129.0 dB"));
  EXPECT_EQ(summaryIn("Cells", {cell("1300", "16"), cell("1300", "16")}).parts.front(), "PCI 16");
  EXPECT_EQ(summaryIn("Cells", {cell("1300", "16"), cell("13001", "16")}).parts.front(),
            "EARFCN 1300, PCI 16");
}

TEST(RecordSummary, OfALonelyRecordHasTheWholeIdentity) {
  EXPECT_EQ(summaryIn("Cells", {cell("1300", "16")}).parts.front(), "EARFCN 1300, PCI 16");
}

TEST(RecordSummary, ThePowerOfACellComesBeforeThatOfTheChannelWhichIsCalledSo) {
  const Value measured = dictionaryOf({{"Physical Cell ID", "300"},
                                       {"Measured RSSI", "-90.00 dBm"},
                                       {"Measured RSRP", "-102.00 dBm"},
                                       {"Average RSRP", "-103.00 dBm"},
                                       {"Measured RSRQ", "-4.50 dB"}});
  EXPECT_THAT(summaryIn("Neighbor Cells List", {measured}).parts,
              ElementsAre("PCI 300", "\u2212102.0 dBm", "\u22124.5 dB"));
  EXPECT_THAT(summaryIn("Neighboring Cells", {dictionaryOf({{"ARFCN", "13"}, {"RSSI", "-76 dBm"}})}).parts,
              ElementsAre("ARFCN 13", "RSSI \u221276 dBm"));
}

TEST(RecordSummary, ALevelThatRoundsToZeroHasNoSign) {
  EXPECT_THAT(
      summaryIn("Active Set", {dictionaryOf({{"Scrambling Code", "5"}, {"Energy Per Chip", "-0.04 dB"}})})
          .parts,
      ElementsAre("PSC 5", "0.0 dB"));
}

TEST(RecordSummary, OfRecordsWithoutALevelSaysWhatElseTheyShow) {
  EXPECT_THAT(
      summaryIn("PDP Context Info",
                {dictionaryOf({{"Context ID", "5"}, {"APN", "ims"}, {"State", "Active"}, {"QCI", "5"}})})
          .parts,
      ElementsAre("Context 5", "ims", "Active"));
  EXPECT_THAT(
      summaryIn("Contexts", {dictionaryOf({{"Bearer ID", "5"}, {"State", "Active"}, {"QCI", "9"}})}).parts,
      ElementsAre("Bearer 5", "Active", "QCI 9"));
  EXPECT_THAT(summaryIn("GSM Neighbor Cell List",
                        {dictionaryOf({{"ARFCN", "13"}, {"BSIC Valid", "0"}, {"RSSI", "-76"}})})
                  .parts,
              ElementsAre("ARFCN 13", "RSSI \u221276"));
  EXPECT_THAT(
      summaryIn("TRCH BLER", {dictionaryOf({{"TRCH ID", "1"}, {"TRCH BLER Measurement", "25"}})}).parts,
      ElementsAre("TrCH 1", "BLER 25"));
}

TEST(RecordSummary, OfAMessageIsItsNameAndChannel) {
  EXPECT_THAT(summaryIn("Messages", {dictionaryOf({{"Time", "12:00"},
                                                   {"Radio", "LTE"},
                                                   {"Protocol", "RRC"},
                                                   {"Channel", "UL-DCCH"},
                                                   {"Name", "MeasurementReport"},
                                                   {"EARFCN", "1300"}})})
                  .parts,
              ElementsAre("MeasurementReport", "UL-DCCH"));
  EXPECT_THAT(summaryIn("Messages", {dictionaryOf({{"Protocol", "EMM"}, {"Name", "Attach Request"}})}).parts,
              ElementsAre("Attach Request", "EMM"));
}

TEST(RecordSummary, OfRecordsThatNothingIsKnownAboutIsTheirBeginning) {
  EXPECT_THAT(summaryIn("Equivalent PLMN List",
                        {dictionaryOf({{"Mobile Country Code", "1"}, {"Mobile Network Code", "100"}})})
                  .parts,
              ElementsAre("MCC 1", "MNC 100"));
  EXPECT_THAT(summaryIn("Things", {dictionaryOf({{"A", "-1.5 kHz"}, {"B", "-"}})}).parts,
              ElementsAre("A \u22121.5 kHz", "B -"));
  EXPECT_THAT(summaryIn("Things", {dictionaryOf({{"A", ""}, {"B", "2"}, {"C", "3"}, {"D", "4"}})}).parts,
              ElementsAre("B 2", "C 3"));
  EXPECT_THAT(summaryIn("Things", {dictionaryOf({{"A", ""}})}).parts, IsEmpty());
  EXPECT_THAT(summaryIn("Things", {Value("text")}).parts, IsEmpty());
}

}  // namespace
}  // namespace varnel
