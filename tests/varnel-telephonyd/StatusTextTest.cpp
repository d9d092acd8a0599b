#include "programs/varnel-telephonyd/StatusText.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

using namespace std::chrono_literals;

const ServerStatus replay{.source = "capture",
                          .name = "a \"walk\"\n.pcap",
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
                          .speed = 2.5,
                          .position = 3'723'004ms,
                          .length = 2h,
                          .time = Time{1'700'000'000, 5'000'000},
                          .firstTime = Time{1'699'996'277, 0},
                          .lastTime = Time{1'700'003'477, 999'999'999}};

TEST(StatusText, TellsEachMatterInALine) {
  EXPECT_EQ(statusText(replay),
            "source      capture a \"walk\"\\u000A.pcap\n"
            "technology  kalvi-lte\n"
            "state       paused, speed 2.5\n"
            "position    1:02:03.004 of 2:00:00.000, 2023-11-14 22:13:20 +0000\n"
            "recording   again.pcap\n"
            "channels    1\n"
            "clients     2\n"
            "messages    10 received, 4 delivered, 1 waiting, 2 dropped, 3 refused (1 too long for the "
            "channel, 2 not asked for)\n"
            "bad frames  7\n");
}

TEST(StatusText, TellsHowItStandsWithTheModem) {
  EXPECT_EQ(
      statusText(
          {.source = "ModemManager", .modem = "M1 is registered in Test Net", .technology = "all-radios"})
          .substr(0, 75),
      "source      ModemManager\n"
      "modem       M1 is registered in Test Net\n"
      "technolog");
  EXPECT_EQ(statusJson({.source = "ModemManager", .modem = "M1"}).substr(0, 41),
            R"({"source":"ModemManager","modem":"M1","te)");
}

TEST(StatusText, LeavesOutWhatIsNotKnown) {
  EXPECT_EQ(statusText({.source = "port", .name = "/dev/ttyUSB0", .technology = "all-radios"}),
            "source      port /dev/ttyUSB0\n"
            "technology  all-radios\n"
            "channels    0\n"
            "clients     0\n"
            "messages    0 received, 0 delivered, 0 waiting, 0 dropped, 0 refused (0 too long for the "
            "channel, 0 not asked for)\n");
  EXPECT_EQ(statusJson({.source = "port", .name = "/dev/ttyUSB0", .technology = "all-radios"}),
            R"({"source":"port","name":"/dev/ttyUSB0","technology":"all-radios","clients":0,"channels":0,)"
            R"("messages":{"received":0,"delivered":0,"waiting":0,"dropped":0,"refused":0,"tooLong":0,)"
            R"("notAskedFor":0}})");
}

TEST(StatusText, AStreamThatHasNotBegunHasALength) {
  EXPECT_NE(statusText({.isPlayable = true, .length = 90s}).find("length      0:01:30.000\n"),
            std::string::npos);
}

TEST(StatusText, TellsOfASeek) {
  EXPECT_NE(statusText({.isPlayable = true, .isSeeking = true}).find("state       seeking, speed 1\n"),
            std::string::npos);
  EXPECT_NE(statusText({.isPlayable = true, .isPaused = true, .isSeeking = true})
                .find("state       seeking, then paused, speed 1\n"),
            std::string::npos);
  EXPECT_NE(statusJson({.isPlayable = true, .isSeeking = true}).find(R"("seeking":true)"), std::string::npos);
}

TEST(StatusText, JsonHasSecondsAndMomentsInUtc) {
  EXPECT_EQ(statusJson(replay),
            R"({"source":"capture","name":"a \"walk\"\u000a.pcap","technology":"kalvi-lte",)"
            R"("recording":"again.pcap","clients":2,"channels":1,"messages":{"received":10,"delivered":4,)"
            R"("waiting":1,"dropped":2,"refused":3,"tooLong":1,"notAskedFor":2},"badFrames":7,)"
            R"("paused":true,"seeking":false,"speed":2.5,"position":3723.004,"length":7200.000,)"
            R"("time":"2023-11-14T22:13:20.005Z","firstTime":"2023-11-14T21:11:17.000Z",)"
            R"("lastTime":"2023-11-14T23:11:17.999Z"})");
}

TEST(StatusText, APlaceIsADurationOrAMomentInUtc) {
  EXPECT_EQ(readPlace("90"), StreamPlace(90s));
  EXPECT_EQ(readPlace("90.25"), StreamPlace(90'250ms));
  EXPECT_EQ(readPlace("1:30"), StreamPlace(90s));
  EXPECT_EQ(readPlace("2:01:30.5"), StreamPlace(7'290'500ms));
  EXPECT_EQ(readPlace("0.0009"), StreamPlace(0ms));
  EXPECT_EQ(readPlace("2023-11-14 22:13:20"), StreamPlace(Time{1'700'000'000, 0}));
  EXPECT_EQ(readPlace("2023-11-14T22:13:20.5Z"), StreamPlace(Time{1'700'000'000, 500'000'000}));
  EXPECT_EQ(readPlace("2023-11-14 22:13"), StreamPlace(Time{1'699'999'980, 0}));
}

TEST(StatusText, OtherTextsAreNoPlace) {
  for (const char* const text :
       {"", "x", "-1", "1:", "1:2:3:4", "1.", "1.x", "1:30x", "99999999999", "2023-02-30 00:00:00",
        "2023-11-14", "2023-11-14 24:00:00", "2023-11-14 22:60:00", "2023-11-14 22:13:20+01:00"})
    EXPECT_EQ(readPlace(text), std::nullopt) << text;
}

}  // namespace
}  // namespace varnel
