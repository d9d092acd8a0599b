#include "programs/varnel-telephonyd/ReplaySource.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <string>
#include <utility>
#include <vector>

namespace varnel {
namespace {

using namespace std::chrono_literals;
using AtEnd = ReplaySource::AtEnd;
using Messages = std::vector<std::pair<std::chrono::milliseconds, Bytes>>;

class Replay : public testing::Test {
 protected:
  Replay() {
    std::string name = (std::filesystem::temp_directory_path() / "varnel-replay-XXXXXX").string();
    _folder = ::mkdtemp(name.data());
  }
  ~Replay() override { std::filesystem::remove_all(_folder); }

  std::string path() const { return (_folder / "replay.pcap").string(); }

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
  std::filesystem::path _folder;
};

TEST_F(Replay, MessagesKeepTheirOrderAndDistances) {
  write({{{1000, 900'000'000}, {1}}, {{1001, 0}, {2}}, {{1003, 500'000'000}, {3}}});
  EXPECT_EQ(play({path(), 1, AtEnd::Stop}), (Messages{{0ms, {1}}, {100ms, {2}}, {2600ms, {3}}}));
}

TEST_F(Replay, SpeedDividesTheDistances) {
  write({{{1000, 0}, {1}}, {{1004, 0}, {2}}});
  EXPECT_EQ(play({path(), 4, AtEnd::Stop}), (Messages{{0ms, {1}}, {1000ms, {2}}}));
  EXPECT_EQ(play({path(), 0.5, AtEnd::Stop}), (Messages{{0ms, {1}}, {8000ms, {2}}}));
}

TEST_F(Replay, ATimeThatGoesBackIsWaitedForByNobody) {
  write({{{1000, 0}, {1}}, {{1002, 0}, {2}}, {{900, 0}, {3}}, {{1003, 0}, {4}}});
  EXPECT_EQ(play({path(), 1, AtEnd::Stop}), (Messages{{0ms, {1}}, {2s, {2}}, {2s, {3}}, {3s, {4}}}));
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

TEST_F(Replay, ACaptureThatIsGoneHasNoMessages) { EXPECT_TRUE(play({path(), 1, AtEnd::Stop}).empty()); }

}  // namespace
}  // namespace varnel
