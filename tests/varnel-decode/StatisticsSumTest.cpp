#include "programs/varnel-decode/StatisticsSum.h"

#include <gtest/gtest.h>

#include <sstream>

namespace varnel {
namespace {

constexpr const char* monday =
    R"({"Capture":"a","Messages":[{"Name":"0xB0C1","Log Code":45249,"Received":3,"Decoded":1,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":2,"Unknown Versions":[{"Version":"9","Messages":1},{"Version":null,"Messages":1}]},{"Name":"objects","Log Code":null,"Received":1,"Decoded":1,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":0,"Unknown Versions":[]}],"Frames":{"Received":5,"Records":4,"Torn":1},"Noise Bytes":7,"SIM":[{"Number":null,"Records":3},{"Number":2,"Records":1}],"Total":{"Received":4,"Decoded":2,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":2}})"
    "\n";
constexpr const char* tuesday =
    R"({"Messages":[{"Name":"0xB0C0","Log Code":45248,"Received":1,"Decoded":1,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":0,"Unknown Versions":[]},{"Name":"0xB0C1","Log Code":45249,"Received":4,"Decoded":2,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":2,"Unknown Versions":[{"Version":"9","Messages":1},{"Version":"10","Messages":1}]}],"Frames":{"Received":5,"Records":5,"Torn":0},"Noise Bytes":0,"SIM":[{"Number":1,"Records":5}],"Total":{"Received":5,"Decoded":3,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":2}})"
    "\n";
constexpr const char* both =
    R"({"Captures":2,"Messages":[{"Name":"0xB0C0","Log Code":45248,"Received":1,"Decoded":1,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":0,"Unknown Versions":[]},{"Name":"0xB0C1","Log Code":45249,"Received":7,"Decoded":3,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":4,"Unknown Versions":[{"Version":"9","Messages":2},{"Version":"10","Messages":1},{"Version":null,"Messages":1}]},{"Name":"objects","Log Code":null,"Received":1,"Decoded":1,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":0,"Unknown Versions":[]}],"Frames":{"Received":10,"Records":9,"Torn":1},"Noise Bytes":7,"SIM":[{"Number":null,"Records":3},{"Number":1,"Records":5},{"Number":2,"Records":1}],"Total":{"Received":9,"Decoded":5,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":4}})"
    "\n";

std::string sumOf(const std::vector<std::string>& reports) {
  StatisticsSum sum;
  for (const std::string& report : reports) {
    std::istringstream lines(report);
    sum.add(lines, "report");
  }
  return sum.asJson();
}

TEST(StatisticsSum, LinesOfOneReportAndOfSeveralAddUp) {
  EXPECT_EQ(sumOf({std::string(monday) + tuesday}), both);
  EXPECT_EQ(sumOf({monday, tuesday}), both);
  EXPECT_EQ(sumOf({tuesday, monday}), both);
}

TEST(StatisticsSum, SumsAddUpToo) {
  EXPECT_EQ(sumOf({both, ""}), both);
  EXPECT_EQ(sumOf({sumOf({monday}), sumOf({tuesday})}), both);
}

TEST(StatisticsSum, AnotherLineIsNamed) {
  for (const std::string bad : {"{}", "[1]", "not JSON", "", R"({"Messages":[{"Name":1}]})"}) {
    try {
      sumOf({monday + bad + '\n'});
      FAIL() << "it was taken: " << bad;
    } catch (const std::runtime_error& error) {
      EXPECT_STREQ(error.what(), "line 2 of report is not one of --stats --format json");
    }
  }
}

TEST(StatisticsSum, ACountIsAnIntegerThatIsNotNegative) {
  for (const std::string bad : {"-5", "1.9", "1e3", "18446744073709551616", "true", "\"1\"", "null"}) {
    std::string report = monday;
    report.replace(report.find(":7,"), 3, ":" + bad + ",");
    EXPECT_THROW(sumOf({report}), std::runtime_error) << bad;
    report = both;
    report.replace(report.find(":2,"), 3, ":" + bad + ",");
    EXPECT_THROW(sumOf({report}), std::runtime_error) << bad;
  }
}

}  // namespace
}  // namespace varnel
