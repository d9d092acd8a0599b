#include "LogGenerator/KLV/GSMUMTS/KLV_GSMLogGenerator.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <map>

#include "base/PropertyList.h"
#include "tests/support/CellMonitorRecords.h"
#include "tests/support/Describe.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using testing::ElementsAre;

// The list sections: each is an array without an element.
const std::vector<std::string> listSections = {
    "Active Set",           "Neighboring Cells", "PDP Context Info",
    "Detected Set",         "GSM Set",           "UMTS Set",
    "Equivalent PLMN List", "Monitored Set",     "Non-Ranked GSM Set",
    "Non-Ranked UMTS Set",  "Virtual Active Set"};

// The other sections with the labels of all their texts.
const std::map<std::string, std::vector<std::string>> rowSections = {
    {"Coding Scheme", {}},
    {"Cell Change Counters", {}},
    {"UMTS RR Measurement", {}},
    {"GPRS Information",
     {"Access Burst Type", "Cell Reselect Hysteresis", "Count HR", "Count LR", "DRX Timer Max",
      "Ext Measurement Order", "Network Control Order", "Network Operating Mode", "PBCCH Present",
      "PFC Supported", "Packet PSI Status", "Packet SI Status", "Priority Access Threshold", "SI13 Position",
      "T3192"}},
    {"GSM Serving Cell", {"ARFCN", "BSIC", "C1 Value", "C2 Value", "Cell ID", "MA Dedicated ARFCN", "RSSI"}},
    {"Mobile Allocation", {"HSN"}},
    {"Process CO", {"MM Service State", "MM State"}},
    {"Process CS", {"LU Reject Cause", "MM Service State", "MM State", "MM Sub State"}},
    {"Process PS", {"Attach Reject Cause", "MM Service State", "MM State", "MM Sub State"}},
    {"Serving PLMN",
     {"Location Area Code", "Mobile Country Code", "Mobile Network Code", "PLMN Sel Mod", "Routing Area Code",
      "Service Type"}},
    {"GSM RR Info",
     {"DRX Used", "DTX Used", "RR Mode", "RR State", "RR Status", "RR Sub State", "Rx Quality Full",
      "Rx Quality Sub", "Serving Rx Level"}},
    {"UMTS RR Info",
     {"Cell ID", "Ciphering", "Downlink Frequency", "RRC State", "Scrambling Code", "Transmit Power",
      "UARFCN", "URA ID", "Uplink Frequency"}},
    {"BLER", {"Window Size"}},
    {"SIM Info",
     {"EF-3GPP MAIL BOX DIALING NUMBER", "EF-ACCESS CONTROL CLASS", "EF-ACTING HPLMN",
      "EF-ADMINISTRATIVE DATA", "EF-FPLMN", "EF-GPRS/PS-LOCI", "EF-HPPLMN SEARCH PERIOD", "EF-ICCID",
      "EF-LOCI", "EF-MSISDN", "EF-OPERATOR PLMN LIST", "EF-OPLMNAcT", "EF-PLMN NETWORK NAME", "EF-RAT MODE"}},
    {"HSDPA Info", {"Carrier Info", "Sub Frames", "Version"}}};

// The entries that are lists; the template may have them, then without an element.
const std::map<std::string, std::vector<std::string>> listRows = {
    {"Mobile Allocation", {"ARFCNs"}},
    {"BLER", {"Transport Channels"}},
    {"HSDPA Info", {"Primary HARQ Process", "Secondary HARQ Process"}}};

Value realTemplate() {
  std::ifstream file(VARNEL_SOURCE_DIR "/resources/KLV_GSM.plist", std::ios::binary);
  const Bytes bytes((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
  return readPropertyList(bytes).value_or(Value());
}

// All values under the key, at any depth.
void collect(const Value& value, std::string_view key, std::vector<Value>& found) {
  if (const Array* array = value.array()) {
    for (const Value& element : *array) collect(element, key, found);
  }
  if (const Dictionary* dictionary = value.dictionary()) {
    for (const auto& [name, content] : *dictionary) {
      if (name == key) found.push_back(content);
      collect(content, key, found);
    }
  }
}
std::vector<Value> allUnder(const Value& root, std::string_view key) {
  std::vector<Value> found;
  collect(root, key, found);
  return found;
}

std::vector<std::string> allSections() {
  std::vector<std::string> names = listSections;
  for (const auto& [name, labels] : rowSections) names.push_back(name);
  return names;
}

// Every key of every dictionary.
void collectKeys(const Value& value, std::vector<std::string>& keys) {
  if (const Array* array = value.array()) {
    for (const Value& element : *array) collectKeys(element, keys);
  }
  if (const Dictionary* dictionary = value.dictionary()) {
    for (const auto& [name, content] : *dictionary) {
      keys.push_back(name);
      collectKeys(content, keys);
    }
  }
}

void expectTextsAndContainersOnly(const Value& value, const std::string& path) {
  EXPECT_TRUE(value.string() || value.array() || value.dictionary()) << path;
  if (const Array* array = value.array()) {
    for (const Value& element : *array) expectTextsAndContainersOnly(element, path + "[]");
  }
  if (const Dictionary* dictionary = value.dictionary()) {
    for (const auto& [name, content] : *dictionary) expectTextsAndContainersOnly(content, path + "/" + name);
  }
}

TEST(KLV_GSMTemplate, IsADictionaryOfTextsAndContainersOnly) {
  const Value root = realTemplate();
  ASSERT_NE(root.dictionary(), nullptr);
  expectTextsAndContainersOnly(root, "");
}

TEST(KLV_GSMTemplate, HasEachOfTheseSectionsExactlyOnce) {
  const Value root = realTemplate();
  for (const std::string& name : allSections()) EXPECT_EQ(allUnder(root, name).size(), 1u) << name;
}

TEST(KLV_GSMTemplate, SectionKeysHaveNoOrderingPrefix) {
  std::vector<std::string> keys;
  collectKeys(realTemplate(), keys);
  for (const std::string& name : allSections()) {
    const auto endsInTheName = [&](const std::string& key) {
      const std::string suffix = ";" + name;
      return key.size() >= suffix.size() && key.substr(key.size() - suffix.size()) == suffix;
    };
    EXPECT_TRUE(std::none_of(keys.begin(), keys.end(), endsInTheName)) << name;
  }
}

TEST(KLV_GSMTemplate, ListSectionsAreEmptyArrays) {
  const Value root = realTemplate();
  for (const std::string& name : listSections) {
    EXPECT_EQ(allUnder(root, name).size(), 1u) << name;
    for (const Value& section : allUnder(root, name)) EXPECT_EQ(described(section), "[]") << name;
  }
}

TEST(KLV_GSMTemplate, TheOtherSectionsAreDictionariesWithAnEmptyTextForEachLabel) {
  const Value root = realTemplate();
  for (const auto& [name, labels] : rowSections) {
    const std::vector<Value> found = allUnder(root, name);
    ASSERT_EQ(found.size(), 1u) << name;
    const Dictionary* section = found.front().dictionary();
    ASSERT_NE(section, nullptr) << name;
    for (const std::string& label : labels)
      EXPECT_EQ(described(section->get(label)), R"("")") << name << "/" << label;
  }
}

TEST(KLV_GSMTemplate, SectionsHaveNoEntriesButThoseOfTheirDecoders) {
  const Value root = realTemplate();
  for (const auto& [name, labels] : rowSections) {
    const std::vector<Value> found = allUnder(root, name);
    ASSERT_EQ(found.size(), 1u) << name;
    ASSERT_NE(found.front().dictionary(), nullptr) << name;
    const auto lists = listRows.find(name);
    for (const auto& [key, content] : *found.front().dictionary()) {
      if (key == "_sorted") continue;
      if (lists != listRows.end() && testing::Value(key, testing::AnyOfArray(lists->second))) {
        EXPECT_EQ(described(content), "[]") << name << "/" << key;
      } else {
        EXPECT_THAT(labels, testing::Contains(key)) << name;
      }
    }
  }
}

class KLV_GSMLogGeneratorTest : public testing::Test {
 protected:
  KLV_GSMLogGeneratorTest() {
    host.resources.add("KLV_GSM", realTemplate());
    generator = KLV_GSMLogGenerator::generator(host.services);
  }

  void update(const Bytes& message) { generator->updateState_withData(state, message); }
  /// A section of the display.
  std::string shown(std::string_view section) {
    const std::vector<Value> found = allUnder(generator->generateLogUsingState(state), section);
    return found.size() == 1 ? described(found.front()) : "not once in the display";
  }
  /// One entry of a section of the display.
  std::string shown(std::string_view section, std::string_view label) {
    const std::vector<Value> found = allUnder(generator->generateLogUsingState(state), section);
    const Dictionary* rows = found.size() == 1 ? found.front().dictionary() : nullptr;
    return rows ? described(rows->get(label)) : "no rows";
  }

  RecordingLog log;
  TestServices host;
  std::unique_ptr<LogGenerator> generator;
  Dictionary state;
};

TEST_F(KLV_GSMLogGeneratorTest, TheTemplateIsNamedKLV_GSM) {
  update({});
  EXPECT_THAT(host.resources.requests(), ElementsAre("KLV_GSM"));
}

TEST_F(KLV_GSMLogGeneratorTest, TheDisplayIsTheTemplateAsLongAsNoPacketCame) {
  update({});
  EXPECT_EQ(described(generator->generateLogUsingState(state)), described(realTemplate()));
}

TEST_F(KLV_GSMLogGeneratorTest, EachOfTheseSectionsIsGivenToItsDecoder) {
  log.take();
  update({});
  const std::vector<std::string> lines = log.takeTexts();
  for (const std::string& name : allSections()) {
    EXPECT_EQ(std::count(lines.begin(), lines.end(), "<4>" + name), 1) << name;
  }
}

// The codes of newer decoders follow.
TEST_F(KLV_GSMLogGeneratorTest, TheStartCommandAsksForAllCodes) {
  const std::string command = described(generator->getStartCommand());
  EXPECT_THAT(
      command,
      testing::StartsWith(
          R"({SetState: "Streaming", SetKalviLogCodes: [16762, 20981, 28981, 20982, 20987, 20989, 20980, )"
          R"(20791, 20788, 20598, 20984, 20991, 28976, 28978, 16389, 28977, 29008, 20780, 20594, 16677, )"
          R"(16433, 16679, 16727, 16662, 16929)"));
  EXPECT_THAT(command, testing::EndsWith("], SetTkExtraCodes: [1, 2, 0]}"));
}

TEST_F(KLV_GSMLogGeneratorTest, APacketUpdatesTheSectionsOfAllItsSubscribers) {
  update(PacketBuilder(0x7132, 16).u8(13, 2).u8(14, 1).bytes());
  EXPECT_EQ(shown("Process PS", "MM Service State"), R"("REG_STATE_REGISTERING")");
  EXPECT_EQ(shown("Process CO", "MM Service State"), R"("REG_STATE_REGISTERING")");
  EXPECT_EQ(shown("Process CS", "MM Service State"), R"("REG_STATE_REGISTERING")");
  EXPECT_EQ(shown("Serving PLMN", "PLMN Sel Mod"), R"("Manual")");
  EXPECT_EQ(shown("Process CO", "MM State"), R"("")");
}

TEST_F(KLV_GSMLogGeneratorTest, ListSectionsOfTheDisplayAreFilled) {
  update(PacketBuilder(0x4005, 25).u8(14, 1).u16(15, 62).u16(17, 21).bytes());
  EXPECT_EQ(shown("GSM Set"), R"([{ARFCN: "62", BSIC: "21", RSSI: "0 dBm", Ranking Value: "0"}])");
  EXPECT_EQ(shown("UMTS Set"), "[]");
  update(PacketBuilder(0x51F8, 17).u8(13, 63).u8(14, 1).u16(15, 975).bytes());
  EXPECT_EQ(shown("Mobile Allocation", "ARFCNs"), R"(["975"])");
  update(PacketBuilder(0x4116, 16).u16(14, 300).bytes());
  EXPECT_EQ(shown("BLER", "Window Size"), R"("300")");
  EXPECT_EQ(shown("BLER", "Transport Channels"), "[]");
}

TEST_F(KLV_GSMLogGeneratorTest, CellMonitorRecordsReachTheDisplay) {
  update(cellMonitorMessage({cellRecord("GSM", "Neighbor", {number("ARFCN", 62), number("RSSI", -43)})}));
  EXPECT_EQ(shown("Neighboring Cells"), R"([{ARFCN: "62", RSSI: "-86 dBm"}])");
}

TEST_F(KLV_GSMLogGeneratorTest, ACellIdentityRemovesTheUarfcnOfTheTemplate) {
  update(PacketBuilder(0x4127, 29).u32(21, 7).bytes());
  EXPECT_EQ(shown("UMTS RR Info", "Cell ID"), R"("7")");
  EXPECT_EQ(shown("UMTS RR Info", "UARFCN"), "absent");
}

TEST_F(KLV_GSMLogGeneratorTest, SectionsWithoutCodesNeverChange) {
  update({});
  const std::vector<std::string> codeless = {"Coding Scheme", "Cell Change Counters", "UMTS RR Measurement",
                                             "Non-Ranked GSM Set", "Non-Ranked UMTS Set"};
  std::map<std::string, std::string> before;
  for (const std::string& name : codeless) before[name] = shown(name);
  for (const std::uint32_t code : {0x417A, 0x51F5, 0x7135, 0x51F6, 0x51FB, 0x51FD, 0x51F4, 0x5137, 0x5134,
                                   0x5076, 0x51F8, 0x51FF, 0x7130, 0x7132, 0x4005, 0x7131, 0x7150, 0x512C,
                                   0x5072, 0x4125, 0x4031, 0x4127, 0x4157, 0x4116, 0x4221}) {
    update(PacketBuilder(code, 300).fill(1).bytes());
  }
  for (const std::string& name : codeless) EXPECT_EQ(shown(name), before[name]) << name;
}

TEST_F(KLV_GSMLogGeneratorTest, CreationAndDestructionAreLogged) {
  log.take();
  auto another = KLV_GSMLogGenerator::generator(host.services);
  EXPECT_THAT(log.takeTexts(), testing::Contains("<3>Creating KLV_GSMLogGenerator object"));
  another.reset();
  EXPECT_THAT(log.takeTexts(),
              testing::Contains(testing::StartsWith("<4>KLV_GSMLogGenerator is destructed 0x")).Times(2));
  EXPECT_EQ(host.standardOutput.str(), "Deallocing KLV_GSMClassIndex\nDeallocing ClassIndex\n");
}

}  // namespace
}  // namespace varnel
