#include "LogGenerator/Radios/Modem/PositionSection.h"

#include <gtest/gtest.h>

#include "tests/LogGenerator/Radios/Modem/ModemReports.h"

namespace varnel::modem {
namespace {

std::string shownOf(Identities identities, std::initializer_list<Dictionary::Entry> position) {
  ReportReader reader;
  PositionSection decoder(reader, identities);
  return shownAfter(decoder, {modemReportOf({{"Position", dictionaryOf(position)}})});
}
std::string shownOf(std::initializer_list<Dictionary::Entry> position) {
  return shownOf(Identities::Shown, position);
}

constexpr const char* nothing = R"({Latitude: "", Longitude: "", Altitude: "", Time: "", Source: ""})";

// 2026-11-22 18:00:00 UTC is 1795370400 s after 1970, and 817063200 s after 2001.
constexpr Date moment{817063200, 250000};

TEST(ModemPosition, CoordinatesAreOnlySaidToBePresent) {
  EXPECT_EQ(shownOf(Identities::Hidden, {{"Latitude", Value::ofReal(52.52)},
                                         {"Longitude", Value::ofReal(13.405)},
                                         {"Altitude", Value::ofReal(34)},
                                         {"Time", Value::ofDate(moment)},
                                         {"Source", "GNSS"}}),
            R"({Latitude: "present", Longitude: "present", Altitude: "present", )"
            R"(Time: "2026-11-22 18:00:00 +0000", Source: "GNSS"})");
}

TEST(ModemPosition, CoordinatesAreShownWhenAskedFor) {
  EXPECT_EQ(shownOf({{"Latitude", Value::ofReal(-52.52)},
                     {"Longitude", Value::ofReal(-0.0000014)},
                     {"Altitude", Value::ofInteger(-12)},
                     {"Time", Value::ofDate(moment)},
                     {"Source", "gpsd"}}),
            R"({Latitude: "-52.520000 °", Longitude: "-0.000001 °", Altitude: "-12.0 m", )"
            R"(Time: "2026-11-22 18:00:00 +0000", Source: "gpsd"})");
}

TEST(ModemPosition, WhatItLacksIsNotShown) {
  EXPECT_EQ(shownOf({{"Latitude", Value::ofInteger(90)}, {"Longitude", Value::ofInteger(-180)}}),
            R"({Latitude: "90.000000 °", Longitude: "-180.000000 °", Altitude: "", Time: "", Source: ""})");
}

TEST(ModemPosition, WithoutBothCoordinatesThereIsNone) {
  EXPECT_EQ(shownOf({{"Latitude", Value::ofReal(1)}, {"Altitude", Value::ofReal(1)}, {"Source", "GNSS"}}),
            nothing);
  EXPECT_EQ(shownOf({{"Longitude", Value::ofReal(1)}, {"Time", Value::ofDate(moment)}}), nothing);
  EXPECT_EQ(shownOf({{"Latitude", Value::ofReal(90.0001)}, {"Longitude", Value::ofReal(0)}}), nothing);
  EXPECT_EQ(shownOf({{"Latitude", Value::ofReal(0)}, {"Longitude", Value::ofReal(-180.0001)}}), nothing);
  EXPECT_EQ(shownOf({{"Latitude", "52"}, {"Longitude", "13"}}), nothing);
}

TEST(ModemPosition, AnImpossibleAltitudeIsNotShown) {
  for (const double altitude : {-1000.1, 100000.1})
    EXPECT_EQ(shownOf({{"Latitude", Value::ofReal(0)},
                       {"Longitude", Value::ofReal(0)},
                       {"Altitude", Value::ofReal(altitude)},
                       {"Time", "now"},
                       {"Source", Value::ofInteger(1)}}),
              R"({Latitude: "0.000000 °", Longitude: "0.000000 °", Altitude: "", Time: "", Source: ""})");
}

}  // namespace
}  // namespace varnel::modem
