#include "LogGenerator/Radios/Modem/Registration.h"

#include <gtest/gtest.h>

#include "tests/LogGenerator/Radios/Modem/ModemReports.h"

namespace varnel::modem {
namespace {

std::string shownOf(std::initializer_list<Dictionary::Entry> entries) {
  ReportReader reader;
  Registration decoder(reader);
  return shownAfter(decoder, {modemReportOf(entries)});
}

TEST(ModemRegistration, ShowsWhereTheModemIsRegistered) {
  EXPECT_EQ(shownOf({{"RegistrationState", Value::ofInteger(5)},
                     {"Operator", "Réseau"},
                     {"PLMN", "26201"},
                     {"AccessTechnologies", Value::ofArray({"LTE", "5GNR"})},
                     {"SignalQuality", Value::ofInteger(71)}}),
            R"({Version: "1", State: "Roaming", Operator: "Réseau", PLMN: "262-01", )"
            R"(Access Technology: "LTE, 5GNR", Signal Quality: "71%"})");
}

TEST(ModemRegistration, EachStateHasItsText) {
  const char* const texts[] = {"Not Registered",
                               "Home",
                               "Searching",
                               "Denied",
                               "Unknown",
                               "Roaming",
                               "Home, SMS Only",
                               "Roaming, SMS Only",
                               "Emergency Only",
                               "Home, CSFB Not Preferred",
                               "Roaming, CSFB Not Preferred",
                               "Restricted Local Services",
                               ""};
  std::int64_t state = 0;
  for (const char* text : texts) {
    EXPECT_EQ(shownOf({{"RegistrationState", Value::ofInteger(state)}}),
              std::string(R"({Version: "1", State: ")") + text +
                  R"(", Operator: "", PLMN: "", Access Technology: "", Signal Quality: ""})");
    ++state;
  }
}

TEST(ModemRegistration, ImpossibleValuesCountAsAbsent) {
  const std::string nothing =
      R"({Version: "1", State: "", Operator: "", PLMN: "", Access Technology: "", Signal Quality: ""})";
  EXPECT_EQ(shownOf({{"RegistrationState", Value::ofInteger(-1)}}), nothing);
  for (const char* plmn : {"", "2620", "2620123", "26201x", "26 201"})
    EXPECT_EQ(shownOf({{"PLMN", plmn}}), nothing) << plmn;
  for (const std::int64_t percent : {-1, 101})
    EXPECT_EQ(shownOf({{"SignalQuality", Value::ofInteger(percent)}}), nothing);
  EXPECT_EQ(shownOf({{"Operator", std::string(129, 'x')}}), nothing);
  EXPECT_EQ(shownOf({{"Operator", "a\tb"}}), nothing);
  EXPECT_EQ(shownOf({{"Operator", "a\x7F"}}), nothing);
  EXPECT_EQ(shownOf({{"AccessTechnologies", Value::ofArray({Value::ofInteger(1), "\x1B[31m"})}}), nothing);
}

TEST(ModemRegistration, TheLongestTextsAreShown) {
  const std::string longest(128, 'x');
  EXPECT_NE(shownOf({{"Operator", longest}}).find(longest), std::string::npos);
}

TEST(ModemRegistration, EightTechnologiesAreShown) {
  EXPECT_EQ(shownOf({{"AccessTechnologies", Value::ofArray({"a", "b", "c", "d", "e", "f", "g", "h", "i"})}}),
            R"({Version: "1", State: "", Operator: "", PLMN: "", )"
            R"(Access Technology: "a, b, c, d, e, f, g, h", Signal Quality: ""})");
}

}  // namespace
}  // namespace varnel::modem
