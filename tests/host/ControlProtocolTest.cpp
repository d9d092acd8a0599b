#include "host/ControlProtocol.h"

#include <gtest/gtest.h>

#include <limits>
#include <string>

namespace varnel {
namespace {

using namespace std::chrono_literals;
using namespace controlProtocol;
using Command = ControlRequest::Command;

Bytes list(const std::string& content) {
  const std::string text = "<plist version=\"1.0\"><dict>" + content + "</dict></plist>";
  return Bytes(text.begin(), text.end());
}

TEST(ControlProtocol, RequestsArriveAsTheyWereSent) {
  const ControlRequest requests[] = {
      {.command = Command::Status},
      {.command = Command::Pause},
      {.command = Command::Continue},
      {.command = Command::SetSpeed, .speed = 0.0015},
      {.command = Command::Seek, .place = 90'250ms},
      {.command = Command::Seek, .place = Time{-5, 999'999'999}},
      {.command = Command::SetTechnology, .technology = "all-radios"},
      {.command = Command::Stop},
  };
  for (const ControlRequest& request : requests) EXPECT_EQ(readRequest(writeRequest(request)), request);
}

TEST(ControlProtocol, BytesThatAreNoRequestAreNone) {
  const std::string seek = "<key>Command</key><string>Seek</string>";
  for (const Bytes& bytes :
       {Bytes(), Bytes{1, 2, 3}, list(""), list("<key>Command</key><integer>1</integer>"),
        list("<key>Command</key><string>Dance</string>"), list("<key>Command</key><string>SetSpeed</string>"),
        list("<key>Command</key><string>SetTechnology</string>"), list(seek),
        list(seek + "<key>Position</key><integer>-1</integer>"),
        list(seek + "<key>Position</key><integer>9223372036854775807</integer>"),
        list(seek + "<key>Time</key><array><integer>1</integer></array>"),
        list(seek + "<key>Time</key><array><integer>1</integer><integer>1000000000</integer></array>")})
    EXPECT_EQ(readRequest(bytes), std::nullopt) << std::string(bytes.begin(), bytes.end());
}

TEST(ControlProtocol, ARequestHas4096BytesAtMost) {
  const std::string status = "<key>Command</key><string>Status</string>";
  const std::size_t size = list(status + "<key></key><string></string>").size();
  const auto ofSize = [&](std::size_t wanted) {
    return list(status + "<key></key><string>" + std::string(wanted - size, 'x') + "</string>");
  };
  EXPECT_TRUE(readRequest(ofSize(4096)));
  EXPECT_FALSE(readRequest(ofSize(4097)));
}

TEST(ControlProtocol, RepliesArriveAsTheyWereSent) {
  const ServerStatus status{.source = "capture",
                            .name = "walk.pcap",
                            .modem = "M1 is locked",
                            .technology = "kalvi-lte",
                            .recording = "again.pcap",
                            .clients = 2,
                            .channels = 1,
                            .received = 10,
                            .delivered = 4,
                            .waiting = 1,
                            .dropped = 2,
                            .tooLong = 1,
                            .notAskedFor = 2,
                            .badFrames = 7,
                            .isPlayable = true,
                            .isPaused = true,
                            .isSeeking = true,
                            .speed = 2.5,
                            .position = 1ms,
                            .length = 2h,
                            .time = Time{1, 2},
                            .firstTime = Time{-3, 4},
                            .lastTime = Time{5, 6}};
  EXPECT_EQ(readReply(writeReply(status)), ControlReply(status));
  EXPECT_EQ(readReply(writeReply(ServerStatus{})), ControlReply(ServerStatus{}));
  EXPECT_EQ(readReply(writeReply(ControlRefusal{"no"})), ControlReply(ControlRefusal{"no"}));
  EXPECT_EQ(readReply(Bytes{1, 2, 3}), std::nullopt);
}

TEST(ControlProtocol, AFileNameThatNoPropertyListHoldsIsLeftOut) {
  const auto reply = readReply(writeReply(ServerStatus{.name = "\xFF", .recording = "\x01", .channels = 3}));
  EXPECT_EQ(reply, ControlReply(ServerStatus{.channels = 3}));
}

TEST(ControlProtocol, SpeedsLieBetweenAThousandthAndAMillion) {
  for (const double speed : {0.001, 1.0, 1'000'000.0}) EXPECT_TRUE(isPlayable(speed));
  for (const double speed : {0.0, -1.0, 0.0009, 1'000'001.0, std::numeric_limits<double>::quiet_NaN()})
    EXPECT_FALSE(isPlayable(speed));
}

}  // namespace
}  // namespace varnel
