#include "LogGenerator/Radios/Modem/ServingCell.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <limits>

#include "tests/LogGenerator/Radios/Modem/ModemReports.h"

namespace varnel::modem {
namespace {

const Radio& radioOf(std::string_view name) { return *std::ranges::find(radios(), name, &Radio::name); }

std::string shownOf(const char* radio, Array cells) {
  ReportReader reader;
  ServingCell decoder(radioOf(radio), reader);
  return shownAfter(decoder, {reportOfCells(std::move(cells))});
}
std::string shownOf(const char* radio, std::initializer_list<Dictionary::Entry> entries) {
  return shownOf(radio, Array{cellOf(radio, "Serving", entries)});
}
// One entry of a cell with one entry.
std::string shownOf(const char* radio, const char* key, const Value& value, const char* label) {
  ReportReader reader;
  ServingCell decoder(radioOf(radio), reader);
  const Value section = Value::ofDictionary();
  shownAfter(decoder, {reportOfCells({cellOf(radio, "Serving", {{key, value}})})}, section);
  const std::string* const text = section.dictionary()->get(label).string();
  return text ? *text : "(no such entry)";
}

TEST(ModemServingCell, ShowsAnLTECell) {
  EXPECT_EQ(shownOf("LTE", {{"PLMN", "310260"},
                            {"TrackingAreaCode", Value::ofInteger(0x1267)},
                            {"CellIdentity", Value::ofInteger(0x1234506)},
                            {"EARFCN", Value::ofInteger(66486)},
                            {"PhysicalCellIdentity", Value::ofInteger(503)},
                            {"Bandwidth", Value::ofInteger(20000)},
                            {"TimingAdvance", Value::ofInteger(12)},
                            {"RSRP", Value::ofReal(-97.25)},
                            {"RSRQ", Value::ofInteger(-11)},
                            {"SINR", Value::ofReal(7.84)},
                            {"RSSI", Value::ofReal(-66)},
                            {"ErrorRate", Value::ofReal(0.5)}}),
            R"({PLMN: "310-260", Tracking Area Code: "4711", Cell Identity: "19088646", eNB: "74565", )"
            R"(Cell: "6", EARFCN: "66486", Band: "66", Downlink Frequency: "2115.0 MHz", )"
            R"(Downlink Bandwidth: "20 MHz", Physical Cell ID: "503", Timing Advance: "12", )"
            R"(RSRP: "-97.25 dBm", RSRQ: "-11.00 dB", SINR: "7.8 dB", RSSI: "-66.00 dBm", )"
            R"(Error Rate: "0.50%"})");
}

TEST(ModemServingCell, ShowsAnNRCell) {
  EXPECT_EQ(shownOf("NR", {{"PLMN", "26201"},
                           {"TrackingAreaCode", Value::ofInteger(0xFFFFFF)},
                           {"CellIdentity", Value::ofInteger(0xFFFFFFFFF)},
                           {"NR-ARFCN", Value::ofInteger(632628)},
                           {"PhysicalCellIdentity", Value::ofInteger(1007)},
                           {"Bandwidth", Value::ofInteger(100000)},
                           {"RSRP", Value::ofReal(-88)},
                           {"RSRQ", Value::ofReal(-10.5)},
                           {"SINR", Value::ofReal(-3)}}),
            R"({PLMN: "262-01", Tracking Area Code: "16777215", Cell Identity: "68719476735", )"
            R"(NR-ARFCN: "632628", Band: "n78, n77", Downlink Frequency: "3489.420 MHz", )"
            R"(Downlink Bandwidth: "100 MHz", Physical Cell ID: "1007", Timing Advance: "", )"
            R"(RSRP: "-88.00 dBm", RSRQ: "-10.50 dB", SINR: "-3.0 dB", RSSI: "", Error Rate: ""})");
}

TEST(ModemServingCell, ShowsAUMTSCell) {
  EXPECT_EQ(shownOf("UMTS", {{"PLMN", "26202"},
                             {"LocationAreaCode", Value::ofInteger(65535)},
                             {"CellIdentity", Value::ofInteger(0xFFFFFFF)},
                             {"UARFCN", Value::ofInteger(10588)},
                             {"ScramblingCode", Value::ofInteger(511)},
                             {"RSCP", Value::ofReal(-91)},
                             {"EcIo", Value::ofReal(-7.5)},
                             {"RSSI", Value::ofReal(-83.5)},
                             {"PathLoss", Value::ofInteger(124)}}),
            R"({PLMN: "262-02", Location Area Code: "65535", Cell Identity: "268435455", UARFCN: "10588", )"
            R"(Band: "1", Downlink Frequency: "2117.6 MHz", Scrambling Code: "511", RSCP: "-91.00 dBm", )"
            R"(EcIo: "-7.50 dB", RSSI: "-83.50 dBm", Path Loss: "124.00 dB", Error Rate: ""})");
}

TEST(ModemServingCell, ShowsAGSMCell) {
  EXPECT_EQ(shownOf("GSM", {{"PLMN", "26203"},
                            {"LocationAreaCode", Value::ofInteger(1)},
                            {"CellIdentity", Value::ofInteger(65535)},
                            {"ARFCN", Value::ofInteger(1023)},
                            {"BaseStationIdentityCode", Value::ofInteger(63)},
                            {"TimingAdvance", Value::ofInteger(0)},
                            {"RSSI", Value::ofInteger(-70)},
                            {"ErrorRate", Value::ofInteger(100)}}),
            R"({PLMN: "262-03", Location Area Code: "1", Cell Identity: "65535", ARFCN: "1023", BSIC: "63", )"
            R"(Timing Advance: "0", RSSI: "-70.00 dBm", Error Rate: "100.00%"})");
}

TEST(ModemServingCell, ShowsACDMA2000Cell) {
  EXPECT_EQ(shownOf("CDMA2000", {{"SystemIdentity", Value::ofInteger(32767)},
                                 {"NetworkIdentity", Value::ofInteger(65535)},
                                 {"BaseStationIdentity", Value::ofInteger(4660)},
                                 {"PilotPN", Value::ofInteger(168)},
                                 {"RSSI", Value::ofReal(-80)},
                                 {"EcIo", Value::ofReal(-6)},
                                 {"SINR", Value::ofReal(9)}}),
            R"({System ID: "32767", Network ID: "65535", Base Station ID: "4660", PN: "168", )"
            R"(RSSI: "-80.00 dBm", EcIo: "-6.00 dB", SINR: "9.0 dB", Error Rate: ""})");
}

TEST(ModemServingCell, ANumberOutsideOfItsLimitsIsNotShown) {
  const struct {
    const char *radio, *key, *label;
    std::int64_t least, most;
  } limits[] = {
      {"LTE", "TrackingAreaCode", "Tracking Area Code", 0, 65535},
      {"LTE", "CellIdentity", "Cell Identity", 0, 268435455},
      {"LTE", "CellIdentity", "eNB", 0, 268435455},
      {"LTE", "EARFCN", "EARFCN", 0, 262143},
      {"LTE", "PhysicalCellIdentity", "Physical Cell ID", 0, 503},
      {"LTE", "Bandwidth", "Downlink Bandwidth", 1, 400000},
      {"LTE", "TimingAdvance", "Timing Advance", 0, 65535},
      {"LTE", "RSRP", "RSRP", -200, 50},
      {"LTE", "RSRQ", "RSRQ", -100, 100},
      {"LTE", "SINR", "SINR", -100, 100},
      {"LTE", "RSSI", "RSSI", -200, 50},
      {"LTE", "ErrorRate", "Error Rate", 0, 100},
      {"NR", "TrackingAreaCode", "Tracking Area Code", 0, 16777215},
      {"NR", "CellIdentity", "Cell Identity", 0, 68719476735},
      {"NR", "NR-ARFCN", "NR-ARFCN", 0, 3279165},
      {"NR", "PhysicalCellIdentity", "Physical Cell ID", 0, 1007},
      {"UMTS", "LocationAreaCode", "Location Area Code", 0, 65535},
      {"UMTS", "CellIdentity", "Cell Identity", 0, 268435455},
      {"UMTS", "UARFCN", "UARFCN", 0, 16383},
      {"UMTS", "ScramblingCode", "Scrambling Code", 0, 511},
      {"UMTS", "RSCP", "RSCP", -200, 50},
      {"UMTS", "EcIo", "EcIo", -100, 100},
      {"UMTS", "PathLoss", "Path Loss", 0, 300},
      {"GSM", "CellIdentity", "Cell Identity", 0, 65535},
      {"GSM", "ARFCN", "ARFCN", 0, 1023},
      {"GSM", "BaseStationIdentityCode", "BSIC", 0, 63},
      {"CDMA2000", "SystemIdentity", "System ID", 0, 32767},
      {"CDMA2000", "NetworkIdentity", "Network ID", 0, 65535},
      {"CDMA2000", "BaseStationIdentity", "Base Station ID", 0, 65535},
      {"CDMA2000", "PilotPN", "PN", 0, 511},
  };
  for (const auto& [radio, key, label, least, most] : limits) {
    SCOPED_TRACE(std::string(radio) + " " + label);
    EXPECT_NE(shownOf(radio, key, Value::ofInteger(least), label), "");
    EXPECT_NE(shownOf(radio, key, Value::ofInteger(most), label), "");
    EXPECT_EQ(shownOf(radio, key, Value::ofInteger(least - 1), label), "");
    EXPECT_EQ(shownOf(radio, key, Value::ofInteger(most + 1), label), "");
    EXPECT_EQ(shownOf(radio, key, Value::ofInteger(std::numeric_limits<std::int64_t>::min()), label), "");
    EXPECT_EQ(shownOf(radio, key, Value::ofInteger(std::numeric_limits<std::int64_t>::max()), label), "");
    EXPECT_EQ(shownOf(radio, key, Value(std::to_string(most)), label), "");
  }
}

TEST(ModemServingCell, ALevelThatIsNoNumberIsNotShown) {
  using Limits = std::numeric_limits<double>;
  for (const double level : {Limits::quiet_NaN(), Limits::infinity(), -Limits::infinity(), Limits::lowest(),
                             Limits::max(), -200.001, 50.001})
    EXPECT_EQ(shownOf("LTE", "RSRP", Value::ofReal(level), "RSRP"), "") << level;
  EXPECT_EQ(shownOf("LTE", "EARFCN", Value::ofReal(1300), "EARFCN"), "");
}

TEST(ModemServingCell, AChannelOfNoBandHasNoFrequency) {
  EXPECT_EQ(shownOf("LTE", "EARFCN", Value::ofInteger(262143), "EARFCN"), "262143");
  EXPECT_EQ(shownOf("LTE", "EARFCN", Value::ofInteger(262143), "Downlink Frequency"), "");
  EXPECT_EQ(shownOf("LTE", "EARFCN", Value::ofInteger(262143), "Band"), "");
  EXPECT_EQ(shownOf("UMTS", "UARFCN", Value::ofInteger(16383), "Downlink Frequency"), "");
  EXPECT_EQ(shownOf("UMTS", "UARFCN", Value::ofInteger(16383), "Band"), "");
}

TEST(ModemServingCell, BandwidthsHaveTheDecimalsThatTheyNeed) {
  EXPECT_EQ(shownOf("LTE", "Bandwidth", Value::ofInteger(1400), "Downlink Bandwidth"), "1.4 MHz");
  EXPECT_EQ(shownOf("NR", "Bandwidth", Value::ofInteger(400000), "Downlink Bandwidth"), "400 MHz");
  EXPECT_EQ(shownOf("NR", "Bandwidth", Value::ofInteger(1), "Downlink Bandwidth"), "0.001 MHz");
}

TEST(ModemServingCell, TheFirstServingCellOfTheRadioCounts) {
  const auto cell = [](const char* radio, const char* type, std::int64_t level) {
    return cellOf(radio, type, {{"RSSI", Value::ofInteger(level)}});
  };
  EXPECT_EQ(shownOf("GSM",
                    Array{cell("LTE", "Serving", -1), cell("GSM", "Neighbor", -2), cell("GSM", "serving", -3),
                          cell("GSM", "Serving", -4), cell("GSM", "Serving", -5)}),
            shownOf("GSM", {{"RSSI", Value::ofInteger(-4)}}));
}

TEST(ModemServingCell, WhatTheNextReportLacksIsEmptied) {
  ReportReader reader;
  ServingCell decoder(radioOf("GSM"), reader);
  EXPECT_EQ(
      shownAfter(decoder,
                 {reportOfCells({cellOf("GSM", "Serving",
                                        {{"ARFCN", Value::ofInteger(7)}, {"RSSI", Value::ofInteger(-70)}})}),
                  reportOfCells({cellOf("GSM", "Serving", {{"ARFCN", Value::ofInteger(8)}})})}),
      R"({PLMN: "", Location Area Code: "", Cell Identity: "", ARFCN: "8", BSIC: "", )"
      R"(Timing Advance: "", RSSI: "", Error Rate: ""})");
}

}  // namespace
}  // namespace varnel::modem
