#include "programs/varnel-telephonyd/live/PositionClient.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QTcpServer>
#include <QTcpSocket>
#include <memory>
#include <optional>
#include <vector>

#include "host/EventLoopQueue.h"
#include "tests/support/EventLoop.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

TEST(PositionInLine, AFixInThreeDimensions) {
  const auto line = positionInLine(
      R"({"class":"TPV","mode":3,"time":"2026-11-22T14:00:05.250Z","lat":52.5,"lon":-13.25,"altMSL":34.5,"alt":1})");
  ASSERT_TRUE(line && *line);
  EXPECT_EQ((*line)->latitude, 52.5);
  EXPECT_EQ((*line)->longitude, -13.25);
  EXPECT_EQ((*line)->altitude_m, 34.5);
  ASSERT_TRUE((*line)->time);
  EXPECT_EQ((*line)->time->seconds, 817'048'805);
  EXPECT_EQ((*line)->time->microseconds, 250'000);
  EXPECT_EQ((*line)->source, "gpsd");
}

TEST(PositionInLine, AFlatFixHasNoAltitude) {
  const auto line = positionInLine(R"({"class":"TPV","mode":2,"lat":1,"lon":2,"alt":3})");
  ASSERT_TRUE(line && *line);
  EXPECT_EQ((*line)->altitude_m, std::nullopt);
  EXPECT_FALSE((*line)->time);
}

TEST(PositionInLine, AReportWithoutAFixHasNoPosition) {
  for (const char* text :
       {R"({"class":"TPV","mode":1})", R"({"class":"TPV","mode":3,"lat":91,"lon":0})",
        R"({"class":"TPV","lat":1,"lon":2})", R"({"class":"TPV","mode":3,"lat":"1","lon":2})",
        R"({"class":"TPV","mode":0,"lat":1,"lon":2})"}) {
    const auto line = positionInLine(text);
    ASSERT_TRUE(line) << text;
    EXPECT_FALSE(*line) << text;
  }
}

TEST(PositionInLine, OtherLinesAreNone) {
  for (const char* text : {"", "{", "[]", R"({"class":"SKY","mode":3,"lat":1,"lon":2})", "\xFF\xFF", "null"})
    EXPECT_FALSE(positionInLine(text)) << text;
}

// A service at a port of its own.
class PositionClientTest : public testing::Test {
 protected:
  PositionClientTest() { EXPECT_TRUE(_server.listen(QHostAddress::LocalHost)); }
  void connectClient(std::chrono::milliseconds lifetime = 60s) {
    _client = std::make_unique<PositionClient>(
        PositionClient::Setup{.queue = _queue,
                              .port = _server.serverPort(),
                              .lifetime = lifetime,
                              .moved = [this](const auto& position) { _positions.push_back(position); }});
    EXPECT_TRUE(runUntil([this] { return _server.hasPendingConnections(); }));
    _connection.reset(_server.nextPendingConnection());
  }
  void say(const QByteArray& bytes) const {
    _connection->write(bytes);
    EXPECT_TRUE(_connection->flush());
  }

  EventLoopQueue _queue;
  QTcpServer _server;
  std::unique_ptr<QTcpSocket> _connection;
  std::vector<std::optional<Position>> _positions;
  std::unique_ptr<PositionClient> _client;
};

TEST_F(PositionClientTest, AsksForReportsAndTellsPositions) {
  connectClient();
  EXPECT_TRUE(runUntil([&] { return _connection->canReadLine(); }));
  EXPECT_EQ(_connection->readLine(), "?WATCH={\"enable\":true,\"json\":true};\n");
  say("{\"class\":\"VERSION\"}\r\n{\"class\":\"TPV\",\"mode\":2,\"lat\":1,\"lo");
  runFor(50ms);
  EXPECT_TRUE(_positions.empty());
  say("n\":2}\r\n");
  ASSERT_TRUE(runUntil([&] { return _positions.size() == 1; }));
  ASSERT_TRUE(_positions[0]);
  EXPECT_EQ(_positions[0]->longitude, 2);
}

TEST_F(PositionClientTest, WithoutAFixOrAServiceThereIsNoPosition) {
  connectClient();
  say("{\"class\":\"TPV\",\"mode\":1}\n{\"class\":\"TPV\",\"mode\":2,\"lat\":1,\"lon\":2}\n");
  ASSERT_TRUE(runUntil([&] { return _positions.size() == 1; }));
  say("{\"class\":\"TPV\",\"mode\":1}\n");
  ASSERT_TRUE(runUntil([&] { return _positions.size() == 2; }));
  EXPECT_FALSE(_positions[1]);
  say("{\"class\":\"TPV\",\"mode\":2,\"lat\":1,\"lon\":2}\n");
  ASSERT_TRUE(runUntil([&] { return _positions.size() == 3; }));
  _connection.reset();
  ASSERT_TRUE(runUntil([&] { return _positions.size() == 4; }));
  EXPECT_FALSE(_positions[3]);
}

// The service goes on, but its receiver is silent, or repeats what it had.
TEST_F(PositionClientTest, APositionThatIsNotNewIsForgotten) {
  connectClient(100ms);
  say("{\"class\":\"TPV\",\"mode\":2,\"time\":\"2026-11-22T14:00:05.000Z\",\"lat\":1,\"lon\":2}\n");
  ASSERT_TRUE(runUntil([&] { return _positions.size() == 2; }));
  EXPECT_TRUE(_positions[0]);
  EXPECT_FALSE(_positions[1]);
  say("{\"class\":\"TPV\",\"mode\":2,\"time\":\"2026-11-22T14:00:05.000Z\",\"lat\":1,\"lon\":2}\n"
      "{\"class\":\"TPV\",\"mode\":2,\"time\":\"2026-11-22T14:00:06.000Z\",\"lat\":3,\"lon\":4}\n");
  ASSERT_TRUE(runUntil([&] { return _positions.size() == 4; }));
  ASSERT_TRUE(_positions[2]);
  EXPECT_EQ(_positions[2]->latitude, 3);
  EXPECT_FALSE(_positions[3]);
}

TEST_F(PositionClientTest, ALineThatIsTooLongIsLeftOut) {
  connectClient();
  say(QByteArray(1 << 20, ' ') + "{\"class\":\"TPV\",\"mode\":2,\"lat\":9,\"lon\":9}\n");
  say("{\"class\":\"TPV\",\"mode\":2,\"lat\":1,\"lon\":2}\n");
  ASSERT_TRUE(runUntil([&] { return !_positions.empty(); }));
  EXPECT_EQ(_positions.size(), 1u);
  EXPECT_EQ(_positions[0]->latitude, 1);
}

}  // namespace
}  // namespace varnel
