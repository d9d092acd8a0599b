#include "programs/varnel-decode/CaptureReport.h"

#include <gmock/gmock.h>

namespace varnel {
namespace {

using namespace std::chrono_literals;

TEST(CaptureReport, ALineHasWhatIsKnownAndNullForAllElse) {
  EXPECT_EQ(
      reportLine({.path = "a", .fate = CaptureFate::Decoded, .details = "\"Records\":2", .time = 1250ms}),
      R"({"Path":"a","Status":"decoded","Why":null,"Records":2,"Seconds":1.250})"
      "\n");
  EXPECT_EQ(
      reportLine({.path = "a\"b", .fate = CaptureFate::Aborted, .why = "Aborted"}),
      R"({"Path":"a\"b","Status":"aborted","Why":"Aborted","Records":null,"Left Out":null,"Unknown Versions":null,"Seconds":0.000})"
      "\n");
}

TEST(CaptureReport, NamesThatAreNoTextAreToldByTheirBytes) {
  EXPECT_THAT(reportLine({.path = "a\xFF"}),
              testing::StartsWith("{\"Path\":\"a\uFFFD\",\"Path Bytes\":\"61FF\",\"Status\""));
  EXPECT_THAT(reportLine({.path = "a\xFE"}),
              testing::StartsWith("{\"Path\":\"a\uFFFD\",\"Path Bytes\":\"61FE\",\"Status\""));
  EXPECT_THAT(reportLine({.path = "a\uFFFD"}), testing::StartsWith("{\"Path\":\"a\uFFFD\",\"Status\""));
}

}  // namespace
}  // namespace varnel
