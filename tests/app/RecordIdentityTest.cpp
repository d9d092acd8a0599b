#include "app/RecordIdentity.h"

#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

using Entries = std::initializer_list<Dictionary::Entry>;

// The identity of the first record of this list, which is in a display with these other sections.
RecordIdentity identityIn(std::string_view list, Entries record, Entries others = {}) {
  Value display = dictionaryOf(others);
  display.dictionary()->set(list, Value::ofArray({dictionaryOf(record)}));
  PathDictionary paths;
  const auto root = VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
  const auto& itsList = paths.at("/" + std::string(list));
  return identityOfRecord(*itsList->childNodes()->front(), *itsList, *root);
}

std::string textIn(std::string_view list, Entries record, Entries others = {}) {
  return identityIn(list, record, others).text;
}

TEST(RecordIdentity, OfLTECellsIsChannelAndCell) {
  EXPECT_EQ(textIn("Cells",
                   {{"EARFCN", "1300"}, {"Physical Cell ID", "16"}, {"Band", "3"}, {"RSRP", "-84.00 dBm"}}),
            "EARFCN 1300, PCI 16");
}

TEST(RecordIdentity, OfLTECellsOnTheChannelOfASectionNamesThisChannel) {
  EXPECT_EQ(textIn("Neighbor Cells List", {{"Physical Cell ID", "16"}},
                   {{"Neighbor Measurements", dictionaryOf({{"E-ARFCN", "1300"}})}}),
            "EARFCN 1300, PCI 16");
  const Value connected = dictionaryOf({{"E-ARFCN", "100"}, {"Serving Physical Cell ID", "7"}});
  EXPECT_EQ(textIn("Measured Neighbor Cells", {{"Physical Cell ID", "16"}},
                   {{"Connected mode LTE Intra-frequency Measurement", connected}}),
            "EARFCN 100, PCI 16");
  EXPECT_EQ(textIn("Detected Cells", {{"Physical Cell ID", "16"}},
                   {{"Connected mode LTE Intra-frequency Measurement", connected}}),
            "EARFCN 100, PCI 16");
}

TEST(RecordIdentity, WithoutTheSectionOfTheChannelTheCellIsLeft) {
  EXPECT_EQ(textIn("Detected Cells", {{"Physical Cell ID", "16"}}), "PCI 16");
  EXPECT_EQ(textIn("Detected Cells", {{"Physical Cell ID", "16"}},
                   {{"Connected mode LTE Intra-frequency Measurement", dictionaryOf({{"E-ARFCN", ""}})}}),
            "PCI 16");
}

TEST(RecordIdentity, OfUMTSCellsIsChannelAndScramblingCodeWhateverTheChannelIsCalled) {
  EXPECT_EQ(textIn("UMTS Set", {{"UARFCN", "10700"}, {"Scrambling Code", "5"}}), "UARFCN 10700, PSC 5");
  EXPECT_EQ(textIn("UMTS Set", {{"Scrambling Code", "5"}, {"Downlink Frequency", "10700"}}),
            "UARFCN 10700, PSC 5");
  EXPECT_EQ(
      textIn("Active Set", {{"Scrambling Code", "5"}},
             {{"UMTS RR Info", dictionaryOf({{"Scrambling Code", "9"}, {"Downlink Frequency", "10700"}})}}),
      "UARFCN 10700, PSC 5");
  EXPECT_EQ(textIn("Neighbor Cell List", {{"UARFCN", "10050"}, {"Cell ID", "4"}, {"inJDCS", "FALSE"}}),
            "UARFCN 10050, Cell 4");
}

TEST(RecordIdentity, OfGSMCellsIsChannelBandAndStationCode) {
  EXPECT_EQ(textIn("GSM Set", {{"ARFCN", "62"}, {"BSIC", "37"}, {"RSSI", "-80 dBm"}}), "ARFCN 62, BSIC 37");
  EXPECT_EQ(textIn("Neighboring Cells", {{"ARFCN", "62"}, {"RSSI", "-80 dBm"}}), "ARFCN 62");
  EXPECT_EQ(textIn("GSM Neighbor Cell List", {{"Cell ID", "1"},
                                              {"Band Indicator", "0"},
                                              {"BSIC Valid", "1"},
                                              {"NCC", "4"},
                                              {"BCC", "5"},
                                              {"ARFCN", "62"}}),
            "ARFCN 62, Band 0, NCC 4, BCC 5");
  EXPECT_EQ(
      textIn("GSM Neighbor Cell List",
             {{"Band Indicator", "0"}, {"BSIC Valid", "0"}, {"NCC", "4"}, {"BCC", "5"}, {"ARFCN", "62"}}),
      "ARFCN 62, Band 0");
}

TEST(RecordIdentity, OfCandidatesBeginsWithTheirRadio) {
  constexpr std::string_view list = "Reselection Candidates List";
  EXPECT_EQ(textIn(list, {{"Candidate Priority", "1"},
                          {"Candidate RAT Type", "LTE"},
                          {"E ARFCN", "1300"},
                          {"Cell ID", "16"}}),
            "LTE, EARFCN 1300, Cell 16");
  EXPECT_EQ(textIn(list, {{"Candidate RAT Type", "UTRAN"}, {"U ARFCN", "10700"}, {"PSC", "5"}}),
            "UTRAN, UARFCN 10700, PSC 5");
  EXPECT_EQ(
      textIn(list, {{"Candidate RAT Type", "GERAN"}, {"ARFCN", "62"}, {"Band", "1"}, {"BSIC ID", "37"}}),
      "GERAN, ARFCN 62, Band 1, BSIC 37");
  EXPECT_EQ(
      textIn(list, {{"Candidate RAT Type", "CDMA1XRTT"}, {"Band", "0"}, {"Channel", "384"}, {"Pilot", "84"}}),
      "CDMA1XRTT, Channel 384, Band 0, PN 84");
}

TEST(RecordIdentity, OnlyTheRowsOfAnNRChannelBelongToItsServingCell) {
  const RecordIdentity layer = identityIn(
      "Layers", {{"NR-ARFCN", "620000"}, {"Serving Cell", "44"}, {"SSB", "3"}, {"RSRP Rx0", "-90.00 dBm"}});
  EXPECT_EQ(layer.text, "NR-ARFCN 620000");
  EXPECT_EQ(layer.ownRows, "NR-ARFCN 620000, Serving PCI 44");
  EXPECT_EQ(identityIn("Beams", {{"SSB", "3"}}).text, "SSB 3");
  EXPECT_EQ(identityIn("Beams", {{"SSB", "3"}}).ownRows, "SSB 3");
}

TEST(RecordIdentity, OfOtherRecordsIsTheirOwnNumber) {
  EXPECT_EQ(textIn("Contexts", {{"Bearer ID", "5"}, {"State", "Active"}}), "Bearer 5");
  EXPECT_EQ(textIn("PDP Context Info", {{"Context ID", "2"}, {"Bytes Sent", "1200"}}), "Context 2");
  EXPECT_EQ(textIn("Transport Channels", {{"Transport Channel ID", "2"}}), "Transport Channel 2");
  EXPECT_EQ(textIn("TRCH BLER", {{"TRCH ID", "2"}}), "TrCH 2");
  EXPECT_EQ(textIn("CCTRCH SIR", {{"CCTRCH ID", "2"}, {"TSNUM", "6"}}), "CCTrCH 2, Timeslot 6");
  EXPECT_EQ(textIn("Primary HARQ Process", {{"Process ID", "2"}}), "Process 2");
}

TEST(RecordIdentity, MessagesAndOtherRecordsHaveNone) {
  EXPECT_EQ(textIn("Messages", {{"Time", "12:00"}, {"EARFCN", "1300"}, {"Physical Cell ID", "16"}}), "");
  EXPECT_EQ(textIn("PDP Context Info", {{"APN", "internet"}}), "");
  EXPECT_EQ(textIn("Cells", {{"Physical Cell ID", ""}}), "") << "an empty text says nothing";
}

TEST(RecordIdentity, TheTextsOfSIRBelongToTheirPlaces) {
  EXPECT_TRUE(placesAreIdentities("SIR"));
  EXPECT_FALSE(placesAreIdentities("ARFCNs"));
}

}  // namespace
}  // namespace varnel
