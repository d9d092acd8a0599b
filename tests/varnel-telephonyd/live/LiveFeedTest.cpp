#include "programs/varnel-telephonyd/live/LiveFeed.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "base/PropertyList.h"
#include "tests/support/Describe.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

constexpr std::uint32_t simFiles = 0xFF0000, cellMonitor = 0xFF0001, packetData = 0xFF0002,
                        modemReport = 0xFF0003;

class LiveFeedTest : public testing::Test {
 protected:
  void send(std::uint32_t logCode, const std::string& payload) { _feed.send(logCode, Value(payload)); }
  void sendMany(std::uint32_t logCode, int count) {
    for (int number = 1; number <= count; ++number) {
      _uptime += 1s;
      send(logCode, std::to_string(number));
    }
  }
  // The packets that wait, such as "3: 17" for one of 0xFF0003. Their moments follow each other.
  static std::vector<std::string> taken(MessageSource& source) {
    std::vector<std::string> packets;
    auto before = 0ms;
    while (const auto message = source.next()) {
      EXPECT_GE(message->at, before);
      before = message->at;
      constexpr std::size_t headerSize = 13;
      const auto payload = readPropertyList(ByteView(message->bytes).subspan(headerSize));
      packets.push_back(std::to_string(message->bytes.at(3)) + ": " + (payload ? *payload->string() : ""));
    }
    return packets;
  }

  std::chrono::milliseconds _uptime = 0ms;
  LiveFeed _feed{{.uptime = [this] { return _uptime; }, .name = "a test"}};
};

TEST_F(LiveFeedTest, WhatIsTheSameIsLeftOut) {
  const auto source = _feed.makeSource();
  send(simFiles, "a");
  send(simFiles, "a");
  send(simFiles, "b");
  EXPECT_EQ(taken(*source), (std::vector<std::string>{"0: a", "0: b"}));
}

TEST_F(LiveFeedTest, AViewerThatStallsKeepsTheLastPacketOfEachKind) {
  const auto source = _feed.makeSource();
  send(simFiles, "old card");
  send(packetData, "old bearer");
  sendMany(modemReport, 254);
  EXPECT_EQ(source->takeLost(), 0u);
  send(simFiles, "new card");
  EXPECT_EQ(source->takeLost(), 1u);
  sendMany(cellMonitor, 300);
  send(packetData, "new bearer");
  EXPECT_EQ(source->waiting(), 256u);
  EXPECT_EQ(source->takeLost(), 301u);
  const auto packets = taken(*source);
  ASSERT_EQ(packets.size(), 256u);
  EXPECT_EQ(packets[0], "3: 254");
  EXPECT_EQ(packets[1], "0: new card");
  EXPECT_EQ(packets[2], "1: 48");
  EXPECT_EQ(packets[254], "1: 300");
  EXPECT_EQ(packets[255], "2: new bearer");
}

TEST_F(LiveFeedTest, NoPacketIsDroppedBecauseItIsLate) {
  EXPECT_EQ(_feed.makeSource()->lateness(), MessageSource::Lateness::Waits);
}

TEST_F(LiveFeedTest, AStalledViewerTakesNothingFromAnother) {
  const auto stalled = _feed.makeSource();
  sendMany(modemReport, 400);
  const auto other = _feed.makeSource();
  EXPECT_EQ(taken(*other), std::vector<std::string>{"3: 400"});
  EXPECT_EQ(other->takeLost(), 0u);
  EXPECT_EQ(stalled->takeLost(), 144u);
}

}  // namespace
}  // namespace varnel
