#include "model/Explanations.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <functional>
#include <set>

#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/SortedKey.h"
#include "host/FileResources.h"
#include "model/VarnelModelNode.h"
#include "platform/TelephonyService.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/SimulatedMessages.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::IsEmpty;

// ---- How paths find their entries ----

class ExplanationsTest : public testing::Test {
 protected:
  ExplanationsTest() {
    const Value rows = dictionaryOf({{"RSRP", dictionaryOf({{"Meaning", "How strong the cell is."},
                                                            {"Unit", "dBm"},
                                                            {"Usual", "-140 to -44 dBm"},
                                                            {"Standard", "3GPP TS 36.214, 5.1.1"},
                                                            {"Level", "Power"}})},
                                     {"Beams/RSRP", "How strong the beam is."},
                                     {"Cells/*", "A cell."},
                                     {"Counts/**", "How many of this name."},
                                     {"EF-GPRS/PS-LOCI", "Where the phone was."},
                                     {"SIM", "A SIM card."}});
    const Value limits = dictionaryOf({{"Fair", Value::ofInteger(-100)},
                                       {"Good", Value::ofInteger(-90)},
                                       {"Excellent", Value::ofReal(-80.5)},
                                       {"Highest", Value::ofInteger(0)}});
    resources.add("Explanations",
                  dictionaryOf({{"Rows", rows}, {"Levels", dictionaryOf({{"Power", limits}})}}));
  }

  std::string meaning(std::string_view path) const {
    const auto found = Explanations(resources).of(path);
    return found ? found->meaning : "(none)";
  }
  std::string levelOf(std::string_view path, std::string_view value) const {
    NumberFormats formats;
    formats.add("Cells", "RSRP", real("%.2f dBm"));
    formats.add("Cells", "RSRP", integer());
    const std::string names[] = {"Cells", "RSRP"};
    const auto level = Explanations(resources).levelOf(path, value, formats.at(names).formats);
    return level ? std::string(nameOf(*level)) : "(none)";
  }

  FakeResources resources;
};

TEST_F(ExplanationsTest, TheLongestEndOfAPathCounts) {
  for (const char* path : {"RSRP", "/RSRP", "LTE/Measurements/RSRP", "/SIM 1/LTE/Cells/3/RSRP"})
    EXPECT_EQ(meaning(path), "How strong the cell is.") << path;
  for (const char* path : {"/NR/Beams/RSRP", "/NR/Beams/0/RSRP", "Beams[SSB=1]/RSRP", "Beams[SSB 1]/RSRP"})
    EXPECT_EQ(meaning(path), "How strong the beam is.") << path;
  for (const char* path : {"", "/", "//", "xRSRP", "RSRP/x", "[", "RSRP[", "]/[", "Beams"})
    EXPECT_EQ(meaning(path), "(none)") << path;
}

TEST_F(ExplanationsTest, ARecordAndACardHaveEntriesWhateverTheirNumber) {
  EXPECT_EQ(meaning("/LTE/Cells/17"), "A cell.");
  EXPECT_EQ(meaning("/LTE/Cells[EARFCN=1300][Physical Cell ID=16]"), "A cell.");
  EXPECT_EQ(meaning("/LTE/Cells/x"), "(none)");
  EXPECT_EQ(meaning("/SIM 2"), "A SIM card.");
}

TEST_F(ExplanationsTest, NamesThatOnlyAModemTellsShareAnEntry) {
  EXPECT_EQ(meaning("/Messages/Counts/LTE RRC Paging"), "How many of this name.");
  EXPECT_EQ(meaning("/Messages/Counts/LTE NAS A/B"), "How many of this name.");
  EXPECT_EQ(meaning("/Messages/Counts"), "(none)");
}

TEST_F(ExplanationsTest, ANameMayHaveASlash) {
  EXPECT_EQ(meaning("/SIM Info/EF-GPRS/PS-LOCI"), "Where the phone was.");
}

TEST_F(ExplanationsTest, TheTextHasALinePerMatter) {
  EXPECT_EQ(
      Explanations(resources).of("RSRP")->text(),
      "How strong the cell is.\n"
      "Unit: dBm\n"
      "Usual: -140 to -44 dBm\n"
      "Levels: poor below -100 dBm, fair from there, good from -90 dBm, excellent from -80.5 dBm (a rule of "
      "thumb, not a standard)\n"
      "Defined in: 3GPP TS 36.214, 5.1.1\n");
  EXPECT_EQ(Explanations(resources).of("Beams/RSRP")->text(), "How strong the beam is.\n");
}

TEST_F(ExplanationsTest, ALevelBeginsAtItsLimit) {
  EXPECT_EQ(levelOf("Cells/RSRP", "-100.01 dBm"), "poor");
  EXPECT_EQ(levelOf("Cells/RSRP", "-100.00 dBm"), "fair");
  EXPECT_EQ(levelOf("Cells/RSRP", "-90.01 dBm"), "fair");
  EXPECT_EQ(levelOf("Cells/RSRP", "-90.00 dBm"), "good");
  EXPECT_EQ(levelOf("Cells/RSRP", "-80.51 dBm"), "good");
  EXPECT_EQ(levelOf("Cells/RSRP", "-80.50 dBm"), "excellent");
  EXPECT_EQ(levelOf("Cells/RSRP", "0.00 dBm"), "excellent");
}

TEST_F(ExplanationsTest, ANumberThatWasReadAlreadyHasTheSameLevel) {
  const Explanations explanations(resources);
  EXPECT_EQ(explanations.levelOf("Cells/RSRP", -90, "dBm"), SignalLevel::Good);
  EXPECT_EQ(explanations.levelOf("Cells/RSRP", -90, ""), std::nullopt);
}

TEST_F(ExplanationsTest, TheLimitsOfARowAreThoseOfItsLevel) {
  const Explanations explanations(resources);
  ASSERT_TRUE(explanations.limitsOf("/Cells/0/RSRP"));
  EXPECT_EQ(explanations.limitsOf("/Cells/0/RSRP")->good, explanations.of("RSRP")->limits->good);
  EXPECT_FALSE(explanations.limitsOf("Beams/RSRP")) << "a text alone";
  EXPECT_FALSE(explanations.limitsOf("nothing"));
}

TEST_F(ExplanationsTest, WhatIsNoReadingHasNoLevel) {
  EXPECT_EQ(levelOf("Cells/RSRP", "0.01 dBm"), "(none)") << "above the highest reading";
  EXPECT_EQ(levelOf("Cells/RSRP", "-90"), "(none)") << "without its unit";
  EXPECT_EQ(levelOf("Cells/RSRP", ""), "(none)");
  EXPECT_EQ(levelOf("Cells/RSRP", "none dBm"), "(none)");
  EXPECT_EQ(levelOf("Beams/RSRP", "-90.00 dBm"), "(none)") << "a row without limits";
}

TEST(Explanations, WithoutTheResourceNothingIsExplained) {
  const FakeResources resources;
  EXPECT_FALSE(Explanations(resources).of("RSRP"));
  EXPECT_THAT(Explanations(resources).keys(), IsEmpty());
  EXPECT_EQ(Explanations(resources).keyFor("RSRP"), "");
}

TEST(Explanations, AResourceOfAnotherKindExplainsNothing) {
  FakeResources resources;
  resources.add(
      "Explanations",
      dictionaryOf(
          {{"Rows", dictionaryOf({{"A", Value::ofArray()}, {"B", dictionaryOf({{"Level", "C"}})}})}}));
  EXPECT_FALSE(Explanations(resources).of("A"));
  EXPECT_EQ(Explanations(resources).of("B")->meaning, "");
  EXPECT_FALSE(Explanations(resources).of("B")->limits);
}

// ---- The shipped resource ----

const FileResources& shipped() {
  static const FileResources resources{resourceFolder()};
  return resources;
}

void addPathsOf(const Value& entries, const std::string& path, std::set<std::string>& paths) {
  if (!entries.dictionary()) return;
  for (const auto& [key, value] : *entries.dictionary()) {
    if (key == sortMark) continue;
    const bool isSorted = entries.dictionary()->has(sortMark);
    const std::string below = path + '/' + std::string(isSorted ? displayNameOfSortedKey(key) : key);
    paths.insert(below);
    addPathsOf(value, below, paths);
  }
}

// What the displays of a simulated modem have shown, records of lists included.
void addPathsOfModem(std::string_view technology, std::set<std::string>& paths) {
  TestServices host;
  const RecordingLog log;
  const auto generator = LogGenerator::generatorFromTechnology(
      technology, {shipped(), host.services.clock, host.services.application, host.services.standardOutput});
  Dictionary state;
  int count = 0;
  for (const SimulatedPacket& message : simulatedMessages(technology, 1, 5min)) {
    generator->updateState_withData(state, message.packet);
    if (++count % 50 != 0) continue;
    PathDictionary shown;
    VarnelModelNode::makeTreeFromObject_withPathDictionary(generator->generateLogUsingState(state), shown);
    for (const auto& [path, node] : shown) paths.insert(path);
  }
  EXPECT_GT(count, 100);
}

constexpr std::string_view templates[] = {"LTE", "UTRAN", "KLV_GSM", "C2KTemplate", "AllRadios"};
constexpr std::string_view technologies[] = {technology::kalviLTE,     technology::kalviUTRAN2,
                                             technology::kalviGSMUMTS, technology::kalviCDMA,
                                             technology::ifxGSM,       technology::allRadios};

// Rows that no simulated modem shows: those of other packets, and the group of a SIM card.
constexpr const char* pathsOfOtherModems[] = {"/SIM 1",
                                              "/NR/Cells/Layers/0/RSRP Rx2",
                                              "/NR/Cells/Layers/0/RSRP Rx3",
                                              "/UMTS/UMTS Set/0/Downlink Frequency",
                                              "/UMTS/UMTS Set/0/Rank Cell RSCP",
                                              "/LTE/Neighbors/Cells/0/RSSI",
                                              "/Modem/Other Cells/0",
                                              "/Modem/Other Cells/0/Radio",
                                              "/Modem/Other Cells/0/Type",
                                              "/Modem/Other Cells/0/RSSI"};

std::set<std::string> allPaths() {
  std::set<std::string> paths(std::begin(pathsOfOtherModems), std::end(pathsOfOtherModems));
  for (const std::string_view name : templates) {
    const Value entries = shipped().propertyList(name);
    EXPECT_TRUE(entries.dictionary()) << name;
    addPathsOf(entries, "", paths);
  }
  for (const std::string_view name : technologies) addPathsOfModem(name, paths);
  paths.erase("/");
  return paths;
}

TEST(ShippedExplanations, EveryRowAndSectionIsExplainedAndNoEntryIsSuperfluous) {
  const Explanations explanations(shipped());
  std::set<std::string> unused;
  for (std::string& key : explanations.keys()) unused.insert(std::move(key));
  ASSERT_FALSE(unused.empty());
  for (const std::string& path : allPaths()) {
    EXPECT_TRUE(explanations.of(path)) << "resources/Explanations.plist has no entry for " << path;
    unused.erase(explanations.keyFor(path));
  }
  EXPECT_THAT(unused, IsEmpty()) << "no display has rows of these names";
}

TEST(ShippedExplanations, EveryLevelIsThatOfARowAndRises) {
  const Value resource = shipped().propertyList("Explanations");
  std::set<std::string> unused;
  for (const auto& [name, limits] : *resource.dictionary()->get("Levels").dictionary()) unused.insert(name);
  const Explanations explanations(shipped());
  for (const auto& [key, row] : *resource.dictionary()->get("Rows").dictionary()) {
    if (!row.dictionary() || !row.dictionary()->has("Level")) continue;
    unused.erase(*row.dictionary()->get("Level").string());
    const auto explanation = explanations.of(key);
    ASSERT_TRUE(explanation && explanation->limits) << key;
    EXPECT_LT(explanation->limits->fair, explanation->limits->good) << key;
    EXPECT_LT(explanation->limits->good, explanation->limits->excellent) << key;
    EXPECT_LE(explanation->limits->excellent, explanation->limits->highest) << key;
    EXPECT_NE(explanation->unit, "") << key;
  }
  EXPECT_THAT(unused, IsEmpty());
}

TEST(ShippedExplanations, AreSentencesOfKnownParts) {
  const Value resource = shipped().propertyList("Explanations");
  const std::set<std::string> parts{"Meaning", "Unit", "Usual", "Standard", "Level"};
  for (const auto& [key, row] : *resource.dictionary()->get("Rows").dictionary()) {
    if (row.dictionary()) {
      for (const auto& [part, text] : *row.dictionary()) {
        EXPECT_TRUE(parts.contains(part)) << key << ": " << part;
        EXPECT_TRUE(text.string() && !text.string()->empty()) << key << ": " << part;
      }
    }
    const auto explanation = Explanations(shipped()).of(key);
    ASSERT_TRUE(explanation) << key;
    EXPECT_TRUE(explanation->meaning.ends_with('.')) << key;
  }
}

TEST(ShippedExplanations, OneNameMeansDifferentThingsInDifferentPlaces) {
  const Explanations explanations(shipped());
  EXPECT_EQ(explanations.keyFor("/LTE/Carriers/Cells/0/RSRP Rx0"), "RSRP Rx0");
  EXPECT_EQ(explanations.keyFor("/NR/Cells/Layers/0/RSRP Rx0"), "Layers/RSRP Rx0");
  EXPECT_EQ(explanations.keyFor("/NR/Cells/Layers/0/Cells/1/Beams/2/RSRP Rx0"), "Beams/RSRP Rx0");
  EXPECT_EQ(explanations.keyFor("/GSM/Neighboring Cells/0/RSSI"), "Neighboring Cells/RSSI");
  EXPECT_EQ(explanations.keyFor("/EV-DO/Active Set/84"), "EV-DO/Active Set/*");
  EXPECT_EQ(explanations.keyFor("/UMTS/Active Set/0"), "Active Set/*");
  EXPECT_EQ(explanations.keyFor("/Messages/Counts/LTE RRC Paging"), "Counts/**");
}

TEST(ShippedExplanations, TheLevelOfAnLTECellIsKnown) {
  NumberFormats formats;
  formats.add("Measurements", "RSRP", real("%.2f dBm"));
  const std::string names[] = {"Measurements", "RSRP"};
  const Explanations explanations(shipped());
  EXPECT_EQ(explanations.levelOf("/LTE/Measurements/RSRP", "-84.00 dBm", formats.at(names).formats),
            SignalLevel::Good);
  EXPECT_EQ(explanations.levelOf("/LTE/Measurements/RSRP", "-120.00 dBm", formats.at(names).formats),
            SignalLevel::Poor);
}

}  // namespace
}  // namespace varnel
