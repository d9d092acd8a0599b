#include "LogGenerator/NumberFormats.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <set>

#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/SortedKey.h"
#include "base/PropertyList.h"
#include "platform/TelephonyService.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/SimulatedMessages.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::IsSupersetOf;

using Path = std::vector<std::string>;

TEST(NumberFormats, AUnitIsTheTextBehindTheNumberWithoutARemark) {
  NumberFormats formats;
  formats.add("Cell", "RSRP", real("%4.2f dBm"));
  formats.add("Cell", "Errors", real("%.2f%% (old)"));
  formats.add("Cell", "Identity", integer());
  EXPECT_EQ(formats.unit(Path{"Cell", "RSRP"}), "dBm");
  EXPECT_EQ(formats.unit(Path{"Cell", "Errors"}), "%");
  EXPECT_EQ(formats.unit(Path{"Cell", "Identity"}), "");
  EXPECT_EQ(formats.unit(Path{"Cell", "Other"}), "");
  EXPECT_EQ(formats.unit(Path{"RSRP"}), "");
}

TEST(NumberFormats, AnEntryOfARecordIsFoundBelowItsSectionAndGroup) {
  NumberFormats formats;
  formats.add("Neighbors", "RSRP", real("%4.2f dBm"));
  formats.add("1x", "Active Set", real("%+.2f dB"));
  EXPECT_EQ(formats.unit(Path{"LTE", "Neighbors", "0", "RSRP"}), "dBm");
  EXPECT_EQ(formats.unit(Path{"1x", "Active Set", "84"}), "dB") << "a pilot of a list of pilots";
}

TEST(NumberFormats, APathAsUsersWriteItLeadsToItsEntry) {
  NumberFormats formats;
  formats.add("Neighbors", "RSRP", real("%4.2f dBm"));
  formats.add("1x", "Active Set", real("%+.2f dB"));
  formats.add("A/B", "C/D", real("%.0f sec"));
  for (const char* path : {"Neighbors/0/RSRP", "/Neighbors/RSRP", "LTE/Neighbors/7/RSRP",
                           "Neighbors[ID=16]/RSRP", "/Neighbors[Name=a/b][ID=16]/RSRP"})
    EXPECT_EQ(formats.under(path).unit(), "dBm") << path;
  EXPECT_EQ(formats.under("1x/Active Set/84").unit(), "dB");
  EXPECT_EQ(formats.under("1x/Active Set[84=x]").unit(), "dB");
  EXPECT_EQ(formats.under("/A/B/C/D").unit(), "sec");
  EXPECT_EQ(formats.under("Neighbors[ID=16]/RSRP").number("-1.00 dBm"), "-1.00");
  for (const char* path : {"Neighbors/RSRPs", "Neighbor/RSRP", "RSRP", "RSRP/Neighbors", "", "/", "//",
                           "Neighbors[", "Neighbors/"})
    EXPECT_EQ(formats.under(path).unit(), "") << path;
}

TEST(NumberFormats, OfSeveralTechnologiesAnEntryHasTheUnitThatAllShow) {
  NumberFormats one, other;
  one.add("Cell", "RSRP", real("%4.2f dBm"));
  one.add("Cell", "Level", real("%4.2f dBm"));
  other.add("Cell", "RSRP", real("%.0f dBm"));
  other.add("Cell", "Level", integer("%d dB"));
  other.add("Set", "Power", integer("%d dB"));
  one.add(other);
  EXPECT_EQ(one.unit(Path{"Cell", "RSRP"}), "dBm");
  EXPECT_EQ(one.unit(Path{"Cell", "Level"}), "");
  EXPECT_EQ(one.unit(Path{"Set", "Power"}), "dB");
}

TEST(NumberFormats, OfAnEntryWithTwoUnitsEachValueHasItsOwn) {
  NumberFormats formats;
  formats.add("Neighbors", "RSSI", integer("%d dBm"));
  formats.add("Neighbors", "RSSI", integer());
  formats.add("Neighbors", "RSRP", integer("%d dBm"));
  const EntryFormats level = formats.at(Path{"Neighbors", "RSSI"}).formats;
  EXPECT_TRUE(level.haveSeveralUnits());
  EXPECT_EQ(level.unitOf("-80 dBm"), "dBm");
  EXPECT_EQ(level.unitOf("30"), "");
  EXPECT_EQ(level.unitOf("none"), "");
  const EntryFormats power = formats.at(Path{"Neighbors", "RSRP"}).formats;
  EXPECT_FALSE(power.haveSeveralUnits());
  EXPECT_EQ(power.unitOf("-80 dBm"), "dBm");
  EXPECT_EQ(EntryFormats().unitOf("-80 dBm"), "");
}

TEST(NumberFormats, AnEntryWithTwoUnitsHasNone) {
  NumberFormats formats;
  formats.add("UMTS Set", "RSCP", integer("%d dB"));
  formats.add("UMTS Set", "RSCP", integer("%d dBm"));
  EXPECT_EQ(formats.unit(Path{"UMTS Set", "0", "RSCP"}), "");
  EXPECT_EQ(formats.number(Path{"UMTS Set", "0", "RSCP"}, "-80 dBm"), "-80");
  EXPECT_EQ(formats.number(Path{"UMTS Set", "0", "RSCP"}, "-80 dB"), "-80");
}

TEST(NumberFormats, ANumberIsWhatStandsBetweenTheTextsOfItsFormat) {
  NumberFormats formats;
  formats.add("Cell", "RSRP", real("%4.2f dBm"));
  formats.add("1x", "Active Set", real("(ref pilot) %+.2f dB"));
  formats.add("1x", "Active Set", real("%+.2f dB"));
  EXPECT_EQ(formats.number(Path{"Cell", "RSRP"}, "-93.25 dBm"), "-93.25");
  EXPECT_EQ(formats.number(Path{"1x", "Active Set", "8"}, "(ref pilot) -3.50 dB"), "-3.50");
  EXPECT_EQ(formats.number(Path{"1x", "Active Set", "8"}, "+1.25 dB"), "1.25");
  EXPECT_EQ(formats.number(Path{"Cell", "Physical Cell ID"}, "289"), "289");
}

TEST(NumberFormats, WhatIsNoNumberHasNone) {
  static constexpr std::string_view states[] = {"Idle"};
  NumberFormats formats;
  formats.add("Cell", "Power", real("%4.2f dBm"));
  formats.add("Cell", "State", entry(states, integer("[Reserved %d]")));
  const Path power{"Cell", "Power"};
  for (const char* text :
       {"Not Present", " nan dBm", "-inf dBm", "", " dBm", "-", "1.", "007", "0x1F", "1e5"})
    EXPECT_EQ(formats.number(power, text), "") << text;
  EXPECT_EQ(formats.number(Path{"Cell", "State"}, "[Reserved 7]"), "");
  EXPECT_EQ(formats.number(Path{"Cell", "Other"}, "-93.25 dBm"), "") << "no decoder says that it has a unit";
}

TEST(NumberFormats, ARowOfMoreThanTenDigitsIsAnIdentity) {
  const NumberFormats formats;
  EXPECT_EQ(formats.number(Path{"SIM", "EF"}, "4294967295"), "4294967295");
  EXPECT_EQ(formats.number(Path{"SIM", "EF"}, "89012604567"), "");
}

// What stands behind the numbers of all displays. A new unit is to be added here, and so is the format that
// shows it to what its decoder tells.
constexpr std::string_view units[] = {"dBm", "dB", "kbps", "%", "sec", "× 64chips"};

Value shippedTemplate(std::string_view name) {
  std::ifstream file(VARNEL_SOURCE_DIR "/resources/" + std::string(name) + ".plist", std::ios::binary);
  const Bytes bytes{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  return readPropertyList(bytes, fileLimits).value_or(Value());
}

// Whether a text begins with a number, perhaps behind a remark, that one of the units follows.
bool seemsToHaveUnit(std::string_view text) {
  if (text.starts_with("(ref pilot) ")) text.remove_prefix(12);
  const std::size_t end = text.find_first_not_of("+-.0123456789");
  if (end == 0 || end == std::string_view::npos) return false;
  const std::string_view rest = text.substr(text[end] == ' ' ? end + 1 : end);
  return std::ranges::any_of(units, [&](std::string_view unit) { return rest.starts_with(unit); });
}

void visitLeaves(const Value& value, Path& path, const auto& visit) {
  if (const std::string* const text = value.string()) visit(path, *text);
  if (const Array* const records = value.array()) {
    for (std::size_t i = 0; i < records->size(); ++i) {
      path.push_back(std::to_string(i));
      visitLeaves((*records)[i], path, visit);
      path.pop_back();
    }
  }
  if (const Dictionary* const rows = value.dictionary()) {
    for (const auto& [key, content] : *rows) {
      path.emplace_back(rows->has(sortMark) ? displayNameOfSortedKey(key) : key);
      visitLeaves(content, path, visit);
      path.pop_back();
    }
  }
}

// Plays all that the simulated modem sends in some minutes, and tells of every leaf whose text has a unit
// whether the number is known. Yields "entry unit" of those whose unit is known.
std::set<std::string> unitsSeen(std::string_view technology,
                                std::initializer_list<std::string_view> templates) {
  TestServices host;
  for (const std::string_view name : templates) host.resources.add(name, shippedTemplate(name));
  RecordingLog log;
  const auto generator = LogGenerator::generatorFromTechnology(technology, host.services);
  const NumberFormats formats = generator->numberFormats();
  Dictionary state;
  std::set<std::string> seen;
  const auto look = [&](const Path& path, const std::string& text) {
    const std::string_view unit = formats.unit(path);
    if (!unit.empty() && !text.empty()) seen.insert(path.back() + " " + std::string(unit));
    if (!seemsToHaveUnit(text)) return;
    EXPECT_NE(formats.number(path, text), "")
        << testing::PrintToString(path) << ": the decoder of '" << text << "' does not tell its format";
  };
  int count = 0;
  for (const SimulatedPacket& message : simulatedMessages(technology, 1, 3min)) {
    generator->updateState_withData(state, message.packet);
    if (++count % 100 != 0) continue;
    Path path;
    visitLeaves(state.get(stateKey::display), path, look);
  }
  EXPECT_GT(count, 100);
  return seen;
}

TEST(NumberFormats, EveryUnitThatAnLTEModemShowsIsKnown) {
  EXPECT_THAT(unitsSeen(technology::kalviLTE, {"LTE"}),
              IsSupersetOf({"Average RSRP dBm", "Measured RSRQ dB", "S Intra Search dB", "Qrxlevmin dBm",
                            "Filtered RSRP dBm", "Serving Filtered RSRQ dB", "Srxlev dBm"}));
}

TEST(NumberFormats, EveryUnitThatAGSMUMTSModemShowsIsKnown) {
  EXPECT_THAT(
      unitsSeen(technology::kalviGSMUMTS, {"KLV_GSM"}),
      IsSupersetOf({"RSCP dB", "Energy Per Chip dB", "Transmit Power dBm", "RSSI dBm", "DRX Used sec"}));
}

TEST(NumberFormats, EveryUnitThatACDMA2000ModemShowsIsKnown) {
  const auto seen = unitsSeen(technology::kalviCDMA, {"C2KTemplate"});
  EXPECT_THAT(seen, IsSupersetOf({"Rx0 AGC dBm", "Tx AGC dBm", "Traffic FER %", "Forward Link Data Rate kbps",
                                  "Reverse Link Data Rate kbps", "Serving Pilot PN Offset × 64chips"}));
  EXPECT_TRUE(std::ranges::any_of(seen, [](const std::string& text) { return text.ends_with(" dB"); }))
      << "pilots have a unit";
}

TEST(NumberFormats, AUTRANModemShowsNoUnits) {
  EXPECT_TRUE(unitsSeen(technology::kalviUTRAN2, {"UTRAN"}).empty());
}

}  // namespace
}  // namespace varnel
