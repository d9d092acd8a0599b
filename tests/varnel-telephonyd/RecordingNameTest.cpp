#include "programs/varnel-telephonyd/RecordingName.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

std::tm moment() {
  std::tm moment{};
  moment.tm_year = 126;
  moment.tm_mon = 10;
  moment.tm_mday = 22;
  moment.tm_hour = 14;
  moment.tm_min = 5;
  moment.tm_sec = 9;
  return moment;
}

TEST(RecordingName, HasTheFieldsOfAMoment) {
  EXPECT_EQ(recordingName("/var/log/walk-%Y%m%d-%H%M%S.pcapng", moment()),
            "/var/log/walk-20261122-140509.pcapng");
  EXPECT_EQ(recordingName("100%%", moment()), "100%");
}

TEST(RecordingName, WithoutFieldsStaysAsItIs) {
  const std::string longName(10'000, 'x');
  for (const std::string& name : {std::string(), std::string("-"), std::string("walk.pcap"), longName})
    EXPECT_EQ(recordingName(name, moment()), name);
}

TEST(RecordingName, HasFieldsOf4096BytesAtMost) {
  EXPECT_EQ(recordingName(std::string(4095, 'x') + "%%", moment()), std::string(4095, 'x') + "%");
  EXPECT_EQ(recordingName(std::string(4096, 'x') + "%%", moment()), "");
}

TEST(RecordingName, OfNowIsOfThisYear) {
  const std::string year = recordingNameOfNow("%Y");
  EXPECT_EQ(year.size(), 4u) << year;
  EXPECT_GE(std::stoi(year), 2024);
}

}  // namespace
}  // namespace varnel
