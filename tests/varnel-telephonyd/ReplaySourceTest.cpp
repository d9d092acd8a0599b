#include "programs/varnel-telephonyd/ReplaySource.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <string>
#include <utility>
#include <vector>

#include "host/CaptureWriter.h"
#include "tests/support/Process.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using AtEnd = ReplaySource::AtEnd;
using Messages = std::vector<std::pair<std::chrono::milliseconds, Bytes>>;

class Replay : public testing::Test {
 protected:
  std::string path() const { return _folder.file("replay.pcap"); }

  void write(const std::vector<std::pair<Time, Bytes>>& records) const {
    CaptureWriter writer(path());
    for (const auto& [time, message] : records) writer.write(time, message);
  }

  static Messages play(ReplaySource source, std::size_t atMost = 100) {
    Messages messages;
    while (messages.size() < atMost) {
      auto next = source.next();
      if (!next) break;
      messages.emplace_back(next->at, std::move(next->bytes));
    }
    return messages;
  }

 private:
  TemporaryFolder _folder;
};

TEST_F(Replay, MessagesKeepTheirOrderAndDistances) {
  write({{{1000, 900'000'000}, {1}}, {{1001, 0}, {2}}, {{1003, 500'000'000}, {3}}});
  EXPECT_EQ(play({path(), 1, AtEnd::Stop}), (Messages{{0ms, {1}}, {100ms, {2}}, {2600ms, {3}}}));
}

TEST_F(Replay, SpeedDividesTheDistances) {
  write({{{1000, 0}, {1}}, {{1002, 0}, {2}}});
  EXPECT_EQ(play({path(), 4, AtEnd::Stop}), (Messages{{0ms, {1}}, {500ms, {2}}}));
  EXPECT_EQ(play({path(), 0.5, AtEnd::Stop}), (Messages{{0ms, {1}}, {4000ms, {2}}}));
}

TEST_F(Replay, DistancesOfLessThanAMillisecondAddUp) {
  std::vector<std::pair<Time, Bytes>> records;
  for (int i = 0; i <= 1000; ++i) records.push_back({{1000, 400'000 * i}, {1}});
  write(records);
  EXPECT_EQ(play({path(), 1, AtEnd::Stop}, 2000).back().first, 400ms);
}

TEST_F(Replay, AMessageThatAnotherOvertookComesTogetherWithIt) {
  write({{{1000, 0}, {1}}, {{1002, 0}, {2}}, {{992, 0}, {3}}, {{1003, 0}, {4}}});
  EXPECT_EQ(play({path(), 1, AtEnd::Stop}), (Messages{{0ms, {1}}, {2s, {2}}, {2s, {3}}, {3s, {4}}}));
}

TEST_F(Replay, AfterAClockWasSetBackTheDistancesAreThoseOfItsNewTime) {
  write({{{5000, 0}, {1}}, {{5002, 0}, {2}}, {{1400, 0}, {3}}, {{1403, 0}, {4}}});
  RecordingLog log;
  EXPECT_EQ(play({path(), 1, AtEnd::Stop}), (Messages{{0ms, {1}}, {2s, {2}}, {2s, {3}}, {5s, {4}}}));
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(Replay, NoWaitIsLongerThanFiveSecondsWhichIsToldOnce) {
  write(
      {{{0, 0}, {1}}, {{5, 0}, {2}}, {{1709301909, 0}, {3}}, {{1709301910, 0}, {4}}, {{1709301916, 0}, {5}}});
  RecordingLog log;
  EXPECT_EQ(play({path(), 1, AtEnd::Stop}),
            (Messages{{0ms, {1}}, {5s, {2}}, {10s, {3}}, {11s, {4}}, {16s, {5}}}));
  EXPECT_EQ(log.takeTexts(),
            (std::vector<std::string>{"<3>The replay of " + path() +
                                      " waits for no message longer than 5 seconds, as between 1970-01-01 "
                                      "00:00:05 +0000 and 2024-03-01 14:05:09 +0000"}));
}

TEST_F(Replay, TheFiveSecondsAreThoseOfTheListener) {
  write({{{1000, 0}, {1}}, {{1050, 0}, {2}}, {{1051, 0}, {3}}});
  EXPECT_EQ(play({path(), 10, AtEnd::Stop}), (Messages{{0ms, {1}}, {5s, {2}}, {5100ms, {3}}}));
  EXPECT_EQ(play({path(), 0.001, AtEnd::StartOver}, 4),
            (Messages{{0ms, {1}}, {5s, {2}}, {10s, {3}}, {15s, {1}}}));
}

TEST_F(Replay, NamesTheRecordOfTheLastMessage) {
  write({{{1000, 0}, {1}}, {{1001, 0}, {2}}});
  ReplaySource source(path(), 1, AtEnd::StartOver);
  for (const char* number : {"1", "2", "1"}) {
    source.next();
    EXPECT_EQ(source.nameOfLast(), std::string("Record ") + number + " of " + path());
  }
}

TEST_F(Replay, StartingOverLeavesASecondBetweenTheRounds) {
  write({{{1000, 0}, {1}}, {{1002, 0}, {2}}});
  EXPECT_EQ(play({path(), 2, AtEnd::StartOver}, 5),
            (Messages{{0ms, {1}}, {1000ms, {2}}, {1500ms, {1}}, {2500ms, {2}}, {3000ms, {1}}}));
}

TEST_F(Replay, AnEmptyCaptureEndsEvenWhenItIsToStartOver) {
  write({});
  EXPECT_TRUE(play({path(), 1, AtEnd::StartOver}).empty());
}

TEST_F(Replay, ADamagedCaptureEndsAtTheFault) {
  write({{{1000, 0}, {1}}, {{1001, 0}, {2, 3, 4}}});
  std::filesystem::resize_file(path(), std::filesystem::file_size(path()) - 1);
  EXPECT_EQ(play({path(), 1, AtEnd::Stop}), (Messages{{0ms, {1}}}));
}

TEST_F(Replay, OfTwoSubscriptionsTheFirstIsPlayedAndALineSaysSo) {
  const Bytes ofFirst{0x81, 1, 1, 13}, ofSecond{0x81, 2, 1, 13}, ofNone{1, 13};
  write({{{1000, 0}, ofNone}, {{1001, 0}, ofSecond}, {{1002, 0}, ofFirst}, {{1003, 0}, ofSecond}});
  RecordingLog log;
  EXPECT_EQ(play({path(), 1, AtEnd::Stop}), (Messages{{0ms, ofNone}, {1s, ofSecond}, {3s, ofSecond}}));
  EXPECT_EQ(log.takeTexts(),
            (std::vector<std::string>{"<3>" + path() +
                                      " has records of SIM 2, which are replayed, and of SIM 1, which are "
                                      "not; choose by --sim"}));
}

TEST_F(Replay, OneSubscriptionIsPlayedWhereItIsNamedAndRecordsKeepTheirNumbers) {
  const Bytes ofFirst{0x81, 1, 1, 13}, ofSecond{0x81, 2, 1, 13}, ofNone{1, 13};
  write({{{1000, 0}, ofSecond}, {{1002, 0}, ofFirst}, {{1003, 0}, ofNone}});
  RecordingLog log;
  EXPECT_EQ(play({path(), 1, AtEnd::StartOver, 1}, 3),
            (Messages{{0ms, ofFirst}, {1s, ofNone}, {2s, ofFirst}}));
  EXPECT_TRUE(log.lines().empty());
  ReplaySource source(path(), 1, AtEnd::StartOver, 1);
  for (const char* number : {"2", "3", "2"}) {
    source.next();
    EXPECT_EQ(source.nameOfLast(), std::string("Record ") + number + " of " + path());
  }
}

TEST_F(Replay, ASubscriptionThatTheCaptureHasNotEndsIt) {
  write({{{1000, 0}, {0x81, 2, 1, 13}}});
  ReplaySource source(path(), 1, AtEnd::StartOver, 1);
  EXPECT_FALSE(source.next());
  EXPECT_EQ(source.endNote(), "the replay of " + path() + " has ended: it has no records of SIM 1");
}

TEST_F(Replay, ACaptureThatIsGoneHasNoMessages) { EXPECT_TRUE(play({path(), 1, AtEnd::Stop}).empty()); }

TEST_F(Replay, TellsHowItHasEnded) {
  write({{{1000, 0}, {1}}});
  ReplaySource source(path(), 1, AtEnd::Stop);
  ASSERT_TRUE(source.next());
  EXPECT_EQ(source.endNote(), "");
  ASSERT_FALSE(source.next());
  EXPECT_EQ(source.endNote(), "the replay of " + path() + " has ended");

  std::filesystem::resize_file(path(), std::filesystem::file_size(path()) - 1);
  ReplaySource cut(path(), 1, AtEnd::Stop);
  ASSERT_FALSE(cut.next());
  EXPECT_TRUE(cut.endNote().starts_with("the replay has ended early: ")) << cut.endNote();
}

}  // namespace
}  // namespace varnel
