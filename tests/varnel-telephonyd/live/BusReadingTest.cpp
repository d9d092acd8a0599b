#include "programs/varnel-telephonyd/live/BusReading.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <limits>
#include <string>

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using Radio = CellReading::Radio;

QVariantMap cell(unsigned type, QVariantMap entries = {}) {
  entries.insert("cell-type", type);
  return entries;
}

TEST(BusReading, NumbersThatAreTextsAreHexadecimal) {
  const auto lte = busReading::cellOf(cell(5, {{"tac", "10"}, {"ci", "FFFFFFF"}, {"physical-ci", "1F7"}}));
  ASSERT_TRUE(lte);
  EXPECT_EQ(lte->area, 16u);
  EXPECT_EQ(lte->identity, 268435455u);
  EXPECT_EQ(lte->code, 503u);
  const auto gsm = busReading::cellOf(cell(2, {{"lac", "FFFF"}, {"ci", "A"}, {"base-station-id", "3F"}}));
  ASSERT_TRUE(gsm);
  EXPECT_EQ(gsm->area, 65535u);
  EXPECT_EQ(gsm->identity, 10u);
  EXPECT_EQ(gsm->code, 63u);
}

TEST(BusReading, WhatIsOutOfRangeIsAbsent) {
  const auto lte = busReading::cellOf(
      cell(5, {{"tac", "10000"}, {"ci", "10000000"}, {"physical-ci", "1F8"}, {"earfcn", 262144u}}));
  ASSERT_TRUE(lte);
  EXPECT_EQ(*lte, (CellReading{.radio = Radio::LTE}));
  for (const char* text : {"", "0x12", "12 ", "-1", "12345678901234567890", "g"})
    EXPECT_EQ(busReading::cellOf(cell(5, {{"ci", text}}))->identity, std::nullopt) << text;
}

TEST(BusReading, ChannelsOfLTEMayBeAbove65535) {
  EXPECT_EQ(busReading::cellOf(cell(5, {{"earfcn", 70645u}}))->channel, 70645u);
}

// 3GPP TS 45.008, 8.1.4.
TEST(BusReading, TheReceivedLevelOfGSMBecomesDecibelMilliwatts) {
  const auto level = [](unsigned step) {
    return busReading::cellOf(cell(2, {{"rx-level", step}}))->levels.rssi_dbm;
  };
  EXPECT_EQ(level(0), -110);
  EXPECT_EQ(level(1), -109);
  EXPECT_EQ(level(62), -48);
  EXPECT_EQ(level(63), -48);
  EXPECT_EQ(level(64), std::nullopt);
  EXPECT_EQ(level(99), std::nullopt);
}

TEST(BusReading, LevelsThatNoModemMeasuresAreAbsent) {
  for (const double level :
       {std::numeric_limits<double>::quiet_NaN(), std::numeric_limits<double>::lowest(), -201.0, 51.0})
    EXPECT_EQ(busReading::cellOf(cell(6, {{"rsrp", level}}))->levels.rsrp_dbm, std::nullopt);
  EXPECT_EQ(busReading::cellOf(cell(6, {{"rsrp", -140}}))->levels.rsrp_dbm, -140.0);
}

TEST(BusReading, OtherKindsOfCellsAreLeftOut) {
  EXPECT_EQ(busReading::cellOf(cell(0)), std::nullopt);
  EXPECT_EQ(busReading::cellOf(cell(4)), std::nullopt);
  EXPECT_EQ(busReading::cellOf(cell(7)), std::nullopt);
  EXPECT_EQ(busReading::cellOf({}), std::nullopt);
}

TEST(BusReading, ACellOfCDMA2000) {
  const auto found = busReading::cellOf(
      cell(1, {{"sid", "1F4"}, {"nid", "B"}, {"base-station-id", "C8"}, {"ref-pn", "1FF"}}));
  ASSERT_TRUE(found);
  EXPECT_EQ(found->systemIdentity, 500u);
  EXPECT_EQ(found->networkIdentity, 11u);
  EXPECT_EQ(found->baseStation, 200u);
  EXPECT_EQ(found->pilot, 511u);
}

TEST(BusReading, ALocationInTheNetworkHasHexadecimalNumbers) {
  const auto location = busReading::networkLocationOf("262,01,1A2B,1C2D3E4,FFFE");
  ASSERT_TRUE(location);
  EXPECT_EQ(*location,
            (NetworkLocation{.network = "26201", .lac = 6699, .tac = 65534, .identity = 29545444}));
}

TEST(BusReading, ALocationSays0ForWhatItDoesNotKnow) {
  EXPECT_EQ(busReading::networkLocationOf("310,260,0,1A,B"),
            (NetworkLocation{.network = "310260", .tac = 11, .identity = 26}));
  // Of an older service.
  EXPECT_EQ(busReading::networkLocationOf("310,260,A,1A"),
            (NetworkLocation{.network = "310260", .lac = 10, .identity = 26}));
  for (const char* text : {"", ",,,,", "1,2,3", "0,0,0,0,0", "31,0260,,,", "262,01,1,2,3,4", "a,b,c,zz,e"})
    EXPECT_EQ(busReading::networkLocationOf(text), std::nullopt) << text;
}

TEST(BusReading, TheServingRadioIsThatOfTheCellInWhichTheModemCamps) {
  EXPECT_EQ(busReading::servingRadioOf(1 << 14), Radio::LTE);
  EXPECT_EQ(busReading::servingRadioOf(1 << 14 | 1 << 15), Radio::LTE);
  EXPECT_EQ(busReading::servingRadioOf(1 << 15), Radio::NR);
  EXPECT_EQ(busReading::servingRadioOf(1 << 9), Radio::UMTS);
  EXPECT_EQ(busReading::servingRadioOf(1 << 1 | 1 << 4), Radio::GSM);
  EXPECT_EQ(busReading::servingRadioOf(1 << 10), std::nullopt);
  EXPECT_EQ(busReading::servingRadioOf(0), std::nullopt);
}

TEST(BusReading, NamesTechnologies) {
  EXPECT_THAT(busReading::accessTechnologiesOf(1 << 14 | 1 << 15), ElementsAre("LTE", "5GNR"));
  EXPECT_THAT(busReading::accessTechnologiesOf(0), IsEmpty());
}

TEST(BusReading, TextsWithControlCharactersOrTooLongOnesAreEmpty) {
  EXPECT_EQ(busReading::text({{"a", QString("good \u00fc")}}, "a"), "good \u00fc");
  EXPECT_EQ(busReading::text({{"a", QString("bad\u001b[2J")}}, "a"), "");
  EXPECT_EQ(busReading::text({{"a", QString(129, 'x')}}, "a"), "");
  EXPECT_EQ(busReading::text({{"a", QString(128, 'x')}}, "a"), std::string(128, 'x'));
  EXPECT_EQ(busReading::text({{"a", 5}}, "a"), "");
}

TEST(BusReading, ABearerThatIsNotConnectedHasNoAddresses) {
  const QVariantMap properties{{"Connected", false},
                               {"Interface", "wwan0"},
                               {"Ip4Config", QVariantMap{{"address", "192.0.2.1"}}},
                               {"Properties", QVariantMap{{"apn", "a"}, {"ip-type", 2u}}}};
  const BearerReading bearer = busReading::bearerOf(properties);
  EXPECT_EQ(bearer.accessPoint, "a");
  EXPECT_EQ(bearer.type, "IPv6");
  EXPECT_FALSE(bearer.isConnected);
  EXPECT_EQ(bearer.ip4.address, "");
}

TEST(BusReading, ADeviceMayHaveALongPath) {
  const QString longest = "/" + QString(4094, 'a');
  EXPECT_EQ(busReading::deviceOf({{"Device", longest}}), longest.toStdString());
  EXPECT_EQ(busReading::deviceOf({{"Device", longest + 'a'}}), "");
  EXPECT_EQ(busReading::deviceOf({{"Device", "/sys/\x1b"}}), "");
  EXPECT_EQ(busReading::deviceOf({{"Device", 1}}), "");
}

// ---- Joining what several interfaces tell ----

const NetworkLocation place{.network = "26201", .lac = 1, .tac = 2, .identity = 3};

TEST(JoinedCells, ALocationCompletesTheServingCell) {
  const auto cells =
      joined({{.radio = Radio::LTE}, {.radio = Radio::LTE, .isServing = true, .channel = 1300}}, {}, place,
             Radio::LTE);
  EXPECT_THAT(cells, ElementsAre(CellReading{.radio = Radio::LTE}, CellReading{.radio = Radio::LTE,
                                                                               .isServing = true,
                                                                               .network = "26201",
                                                                               .area = 2,
                                                                               .identity = 3,
                                                                               .channel = 1300}));
}

TEST(JoinedCells, ALocationOfAnotherCellIsLeftOut) {
  const CellReading serving{.radio = Radio::LTE, .isServing = true, .identity = 4};
  EXPECT_THAT(joined({serving}, {}, place, Radio::LTE), ElementsAre(serving));
}

// Identities of cells are unique in a network alone.
TEST(JoinedCells, ALocationInAnotherNetworkOrAreaIsLeftOut) {
  const CellReading elsewhere{.radio = Radio::LTE, .isServing = true, .network = "26202", .identity = 3};
  EXPECT_THAT(joined({elsewhere}, {}, place, Radio::LTE), ElementsAre(elsewhere));
  const CellReading before{.radio = Radio::LTE, .isServing = true, .area = 1};
  EXPECT_THAT(joined({before}, {}, place, Radio::LTE), ElementsAre(before));
  const CellReading umts{.radio = Radio::UMTS, .isServing = true, .area = 2};
  EXPECT_THAT(joined({umts}, {}, place, Radio::UMTS), ElementsAre(umts));
}

TEST(JoinedCells, ALocationAloneIsAServingCell) {
  EXPECT_THAT(joined({}, {}, place, Radio::UMTS),
              ElementsAre(CellReading{
                  .radio = Radio::UMTS, .isServing = true, .network = "26201", .area = 1, .identity = 3}));
  EXPECT_THAT(joined({}, {}, place, std::nullopt), IsEmpty());
}

TEST(JoinedCells, AnIdentityThatIsTooLongForTheRadioIsOfAnotherOne) {
  EXPECT_THAT(joined({}, {}, NetworkLocation{.network = "26201", .identity = 0x10000}, Radio::GSM),
              IsEmpty());
}

TEST(JoinedCells, SignaledLevelsAreNewerThanThoseOfTheCells) {
  const auto cells =
      joined({{.radio = Radio::NR, .isServing = true, .levels = {.rsrp_dbm = -90, .rsrq_db = -9}}},
             {{.radio = Radio::NR, .isServing = true, .levels = {.rsrp_dbm = -80}},
              {.radio = Radio::GSM, .isServing = true, .levels = {.rssi_dbm = -70}}},
             std::nullopt, std::nullopt);
  EXPECT_THAT(
      cells,
      ElementsAre(
          CellReading{.radio = Radio::NR, .isServing = true, .levels = {.rsrp_dbm = -80, .rsrq_db = -9}},
          CellReading{.radio = Radio::GSM, .isServing = true, .levels = {.rssi_dbm = -70}}));
}

}  // namespace
}  // namespace varnel
