#include "model/events/DisplayEvents.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <ostream>
#include <string>
#include <vector>

#include "base/Dictionary.h"
#include "tests/support/DictionaryOf.h"

namespace varnel {

void PrintTo(const DisplayEvent& event, std::ostream* stream) {
  *stream << event.time.seconds << ' ' << event.section << ' ' << nameOf(event.kind) << ": " << event.from
          << " -> " << event.to;
}

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// A display that grows as the test shows something. As in that of all radios, a group has all its sections as
// soon as it is there.
class DisplayEventsTest : public testing::Test {
 protected:
  static Value child(const Value& parent, std::string_view key) {
    if (parent.dictionary()->get(key).isAbsent()) parent.dictionary()->set(key, Value::ofDictionary());
    return parent.dictionary()->get(key);
  }

  void showIn(const Value& groups, std::string_view group, std::string_view section, std::string_view entry,
              std::string_view text) {
    child(child(groups, group), section).dictionary()->setText(entry, text);
  }
  void show(std::string_view group, std::string_view section, std::string_view entry, std::string_view text) {
    showIn(display, group, section, entry, text);
  }
  void showCell(const std::string& channel, const std::string& cell, const std::string& identity = "") {
    show("1;LTE", "Serving Cell", "EARFCN", channel);
    show("1;LTE", "Serving Cell", "Physical Cell ID", cell);
    show("1;LTE", "Serving Cell", "Cell Identity", identity);
  }

  // One line per event.
  std::vector<std::string> look() {
    std::vector<std::string> lines;
    for (const DisplayEvent& event : events.lookAt(display, {100, 5})) {
      EXPECT_EQ(event.time, (Time{100, 5}));
      lines.push_back(event.section + ": " + std::string(nameOf(event.kind)) + ": " + event.from + " -> " +
                      event.to);
    }
    return lines;
  }

  Value display = Value::ofDictionary();
  DisplayEvents events;
};

TEST_F(DisplayEventsTest, AnAbsentOrEmptyDisplayTellsNothing) {
  EXPECT_THAT(events.lookAt({}, {}), IsEmpty());
  EXPECT_THAT(look(), IsEmpty());
  EXPECT_THAT(events.lookAt("text", {}), IsEmpty());
}

TEST_F(DisplayEventsTest, TheFirstCellIsTold) {
  showCell("5230", "16", "19088646");
  EXPECT_THAT(look(), ElementsAre("LTE/Serving Cell: cell change:  -> EARFCN 5230, Physical Cell ID 16, Cell "
                                  "Identity 19088646"));
  EXPECT_THAT(look(), IsEmpty());
}

TEST_F(DisplayEventsTest, AnotherChannelCellOrIdentityIsAnotherCell) {
  showCell("5230", "16", "1");
  look();
  showCell("5230", "17");
  EXPECT_THAT(look(), ElementsAre("LTE/Serving Cell: cell change: EARFCN 5230, Physical Cell ID 16, Cell "
                                  "Identity 1 -> EARFCN 5230, Physical Cell ID 17"));
  showCell("1300", "17");
  EXPECT_THAT(look(), testing::SizeIs(1));
  showCell("1300", "17", "2");  // the identity of this cell, which comes later
  EXPECT_THAT(look(), IsEmpty());
  showCell("1300", "17", "3");
  EXPECT_THAT(look(), ElementsAre("LTE/Serving Cell: cell change: EARFCN 1300, Physical Cell ID 17, Cell "
                                  "Identity 2 -> EARFCN 1300, Physical Cell ID 17, Cell Identity 3"));
}

TEST_F(DisplayEventsTest, ACellThatVanishesAndComesBackIsTheSame) {
  showCell("5230", "16", "1");
  look();
  showCell("", "");
  EXPECT_THAT(look(), IsEmpty());
  showCell("5230", "16");
  EXPECT_THAT(look(), IsEmpty());
}

TEST_F(DisplayEventsTest, ACellChangeInAConnectionThatLastsIsAHandover) {
  showCell("5230", "16");
  show("1;LTE", "Connection", "RRC State", "Connected");
  show("1;LTE", "Connection", "RRC Connections", "1");
  look();
  showCell("5230", "17");
  EXPECT_THAT(look(), ElementsAre("LTE/Serving Cell: handover: EARFCN 5230, Physical Cell ID 16 -> EARFCN "
                                  "5230, Physical Cell ID 17"));
  showCell("5230", "18");
  show("1;LTE", "Connection", "RRC State", "Idle");
  EXPECT_THAT(look(), ElementsAre("LTE/Serving Cell: cell change: EARFCN 5230, Physical Cell ID 17 -> EARFCN "
                                  "5230, Physical Cell ID 18",
                                  "LTE/Connection: RRC connection: Connected -> Idle"));
  showCell("5230", "19");
  show("1;LTE", "Connection", "RRC State", "Connected");
  EXPECT_THAT(look(), testing::Contains(testing::StartsWith("LTE/Serving Cell: cell change")));
}

TEST_F(DisplayEventsTest, TheFirstCellOfAConnectionIsNoHandover) {
  showCell("", "");
  show("1;LTE", "Connection", "RRC State", "Connected");
  look();
  showCell("5230", "16");
  EXPECT_THAT(look(), ElementsAre(testing::StartsWith("LTE/Serving Cell: cell change")));
}

TEST_F(DisplayEventsTest, CellsOfTheOtherRadiosAreWatched) {
  show("2;NR", "Serving Cell", "NR-ARFCN", "504990");
  show("3;UMTS", "Serving Cell Info", "Downlink UARFCN", "10700");
  show("3;UMTS", "UMTS RR Info", "Cell ID", "77");
  show("4;GSM", "GSM Serving Cell", "ARFCN", "20");
  show("4;GSM", "GSM Serving Cell", "BSIC", "1");
  EXPECT_THAT(look(), ElementsAre("NR/Serving Cell: cell change:  -> NR-ARFCN 504990",
                                  "UMTS/UMTS RR Info: cell change:  -> Cell ID 77",
                                  "UMTS/Serving Cell Info: cell change:  -> Downlink UARFCN 10700",
                                  "GSM/GSM Serving Cell: cell change:  -> ARFCN 20, BSIC 1"));
  show("4;GSM", "GSM Serving Cell", "BSIC", "2");  // another packet corrects it
  show("3;UMTS", "UMTS RR Info", "Scrambling Code", "300");
  EXPECT_THAT(look(), IsEmpty());
  show("3;UMTS", "UMTS RR Info", "Cell ID", "78");
  EXPECT_THAT(look(), ElementsAre("UMTS/UMTS RR Info: cell change: Scrambling Code 300, Cell ID 77 -> "
                                  "Scrambling Code 300, Cell ID 78"));
}

TEST_F(DisplayEventsTest, ADedicatedChannelOfUMTSIsHandedOver) {
  show("3;UMTS", "UMTS RR Info", "RRC State", "CELL_DCH");
  show("3;UMTS", "UMTS RR Info", "Cell ID", "77");
  look();
  show("3;UMTS", "UMTS RR Info", "Cell ID", "78");
  EXPECT_THAT(look(), ElementsAre("UMTS/UMTS RR Info: handover: Cell ID 77 -> Cell ID 78"));
}

TEST_F(DisplayEventsTest, EachStateOfARegistrationIsTold) {
  show("1;LTE", "Registration", "EMM State", "Deregistered");
  EXPECT_THAT(look(), ElementsAre("LTE/Registration: registration:  -> Deregistered"));
  show("1;LTE", "Registration", "EMM State", "Registered");
  show("2;NR", "Registration", "5GMM State", "Registered");
  show("5;Mobility Management", "Process CS", "MM State", "MM_IDLE");
  show("5;Mobility Management", "Process PS", "MM State", "GMM_REGISTERED");
  EXPECT_THAT(look(), ElementsAre("LTE/Registration: registration: Deregistered -> Registered",
                                  "NR/Registration: registration:  -> Registered",
                                  "Mobility Management/Process CS: registration:  -> MM_IDLE",
                                  "Mobility Management/Process PS: registration:  -> GMM_REGISTERED"));
}

TEST_F(DisplayEventsTest, ALossOfServiceIsToldOnceAndSoIsItsEnd) {
  const auto substate = [&](const char* text) {
    show("1;LTE", "Registration", "EMM Substate", text);
    return look();
  };
  EXPECT_THAT(substate("Normal Service"), IsEmpty());
  EXPECT_THAT(substate("No Cell Available"),
              ElementsAre("LTE/Registration: loss of service: Normal Service -> No Cell Available"));
  EXPECT_THAT(substate("PLMN Search"), IsEmpty());
  EXPECT_THAT(substate("Limited Service"), IsEmpty());
  EXPECT_THAT(substate("Attempting to Attach"), IsEmpty());
  EXPECT_THAT(substate("Normal Service"),
              ElementsAre("LTE/Registration: return of service: Attempting to Attach -> Normal Service"));
  EXPECT_THAT(substate("Update Needed"), IsEmpty());
  EXPECT_THAT(substate("Limited Service"),
              ElementsAre("LTE/Registration: loss of service: Update Needed -> Limited Service"));
}

TEST_F(DisplayEventsTest, WhereServiceWasNeverShownNothingIsLostAndNothingReturns) {
  const auto substate = [&](const char* text) {
    show("1;LTE", "Registration", "EMM Substate", text);
    return look();
  };
  EXPECT_THAT(substate("PLMN Search"), IsEmpty());
  EXPECT_THAT(substate("Attempting to Attach"), IsEmpty());
  EXPECT_THAT(substate("No Cell Available"), IsEmpty());
  EXPECT_THAT(substate("Normal Service"), IsEmpty());
  EXPECT_THAT(substate("No Cell Available"),
              ElementsAre("LTE/Registration: loss of service: Normal Service -> No Cell Available"));
}

TEST_F(DisplayEventsTest, EachRadioLosesServiceInItsOwnWords) {
  show("2;NR", "Registration", "5GMM Substate", "Normal Service");
  show("5;Mobility Management", "Process CS", "MM Sub State", "MM_NORMAL_SERVICE");
  show("5;Mobility Management", "Process PS", "MM Sub State", "GMM_NORMAL_SERVICE");
  show("5;Mobility Management", "Process PS", "MM Service State", "REG_STATE_IDLE");
  show("6;PLMN", "Serving PLMN", "Service Type", "CS_PS_SERVICE");
  EXPECT_THAT(look(), IsEmpty());
  show("2;NR", "Registration", "5GMM Substate", "PLMN Search");
  show("5;Mobility Management", "Process CS", "MM Sub State", "MM_LIMITED_SERVICE");
  show("5;Mobility Management", "Process PS", "MM Sub State", "GMM_NO_CELL_AVAILABLE");
  show("5;Mobility Management", "Process PS", "MM Service State", "REG_STATE_OFFLINE");
  show("6;PLMN", "Serving PLMN", "Service Type", "NO_SERVICE");
  EXPECT_THAT(look(), ElementsAre("NR/Registration: loss of service: Normal Service -> PLMN Search",
                                  "Mobility Management/Process CS: loss of service: MM_NORMAL_SERVICE -> "
                                  "MM_LIMITED_SERVICE",
                                  "Mobility Management/Process PS: loss of service: GMM_NORMAL_SERVICE -> "
                                  "GMM_NO_CELL_AVAILABLE",
                                  "Mobility Management/Process PS: loss of service: REG_STATE_IDLE -> "
                                  "REG_STATE_OFFLINE",
                                  "PLMN/Serving PLMN: loss of service: CS_PS_SERVICE -> NO_SERVICE"));
}

TEST_F(DisplayEventsTest, AConnectionIsToldByItsStateOrByItsNumber) {
  const auto connection = [&](const char* state, const char* count) {
    show("1;LTE", "Connection", "RRC State", state);
    show("1;LTE", "Connection", "RRC Connections", count);
    return look();
  };
  EXPECT_THAT(connection("Connected", "1"), ElementsAre("LTE/Connection: RRC connection:  -> Connected"));
  EXPECT_THAT(connection("Idle", "1"), ElementsAre("LTE/Connection: RRC connection: Connected -> Idle"));
  EXPECT_THAT(connection("Connected", "2"), ElementsAre("LTE/Connection: RRC connection: Idle -> Connected"));
  EXPECT_THAT(connection("Connected", "3"),
              ElementsAre("LTE/Connection: RRC connection: Connected, connection "
                          "2 -> Connected, connection 3"));
}

TEST_F(DisplayEventsTest, AVersionThatIsNotKnownIsToldOncePerSection) {
  const auto version = [&](const char* section, const char* text) {
    show("1;LTE", section, "Version", text);
    return look();
  };
  show("1;LTE", "Measurements", "Version", "");
  EXPECT_THAT(version("Serving Cell", "3"), IsEmpty());
  EXPECT_THAT(version("Serving Cell", "37 (not known)"),
              ElementsAre("LTE/Serving Cell: unknown version: 3 -> 37"));
  EXPECT_THAT(version("Serving Cell", "3"), IsEmpty());
  EXPECT_THAT(version("Serving Cell", "37 (not known)"), IsEmpty());
  EXPECT_THAT(version("Serving Cell", "38 (not known)"),
              ElementsAre("LTE/Serving Cell: unknown version: 37 -> 38"));
  EXPECT_THAT(version("Measurements", "25.99 (not known)"),
              ElementsAre("LTE/Measurements: unknown version:  -> 25.99"));
}

TEST_F(DisplayEventsTest, ASectionTells32UnknownVersions) {
  std::size_t count = 0;
  for (int version = 0; version < 40; ++version) {
    show("2;NR", "Cells", "Version", std::to_string(version) + " (not known)");
    count += look().size();
  }
  EXPECT_EQ(count, 32u);
}

TEST_F(DisplayEventsTest, EachSimCardHasEventsOfItsOwn) {
  show("1;LTE", "Registration", "EMM State", "Registered");
  EXPECT_THAT(look(), testing::SizeIs(1));
  const Value card = Value::ofDictionary();
  showIn(card, "1;LTE", "Registration", "EMM State", "Deregistered");
  display.dictionary()->set("SIM 2", card);
  EXPECT_THAT(look(), ElementsAre("SIM 2/LTE/Registration: registration:  -> Deregistered"));
  showIn(card, "2;NR", "Registration", "5GMM State", "Registered");
  EXPECT_THAT(look(), ElementsAre("SIM 2/NR/Registration: registration:  -> Registered"));
  showIn(card, "1;LTE", "Registration", "EMM State", "Registered");
  EXPECT_THAT(look(), ElementsAre("SIM 2/LTE/Registration: registration: Deregistered -> Registered"));
}

TEST_F(DisplayEventsTest, AModemReportTellsOfItsRegistrationAndOfNRCells) {
  show("0;Modem", "Registration", "State", "Home");
  show("0;Modem", "NR Cell", "NR-ARFCN", "632628");
  EXPECT_THAT(look(), ElementsAre("Modem/NR Cell: cell change:  -> NR-ARFCN 632628",
                                  "Modem/Registration: registration:  -> Home"));
  show("0;Modem", "Registration", "State", "Searching");
  EXPECT_THAT(look(), ElementsAre("Modem/Registration: registration: Home -> Searching",
                                  "Modem/Registration: loss of service: Home -> Searching"));
  show("0;Modem", "Registration", "State", "Home");
  show("0;Modem", "NR Cell", "NR-ARFCN", "627264");
  EXPECT_THAT(look(), ElementsAre("Modem/NR Cell: cell change: NR-ARFCN 632628 -> NR-ARFCN 627264",
                                  "Modem/Registration: registration: Searching -> Home",
                                  "Modem/Registration: return of service: Searching -> Home"));
}

TEST_F(DisplayEventsTest, WhatIsInTheWrongPlaceTellsNothing) {
  display.dictionary()->set("1;LTE", "text");
  display.dictionary()->set("SIM 1", Value::ofArray());
  display.dictionary()->set("2;NR",
                            dictionaryOf({{"Serving Cell", Value::ofArray()}, {"Registration", "?"}}));
  display.dictionary()->set(
      "4;GSM", dictionaryOf({{"GSM Serving Cell", dictionaryOf({{"ARFCN", Value::ofInteger(20)}})}}));
  EXPECT_THAT(look(), IsEmpty());
}

TEST_F(DisplayEventsTest, ANewDisplayBeginsAnew) {
  showCell("5230", "16");
  look();
  display = Value::ofDictionary();
  showCell("5230", "16");
  EXPECT_THAT(look(), testing::SizeIs(1));
}

}  // namespace
}  // namespace varnel
