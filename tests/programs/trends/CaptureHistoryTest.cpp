#include "programs/varnel/CaptureHistory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "host/CaptureWriter.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "tests/support/EventLoop.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

constexpr std::int64_t start = 1'700'000'000;

class CaptureHistoryTest : public testing::Test {
 protected:
  CaptureHistory& read() {
    history.emplace(CaptureHistory::Wish{.path = path, .program = VARNEL_NUMBERS_PROGRAM});
    EXPECT_TRUE(runUntil([this] { return !history->isReading(); }));
    return *history;
  }
  // What a modem sends in that time, and then some other messages, one per second.
  void simulate(std::chrono::seconds duration, std::string_view modemOf = technology::allRadios,
                const std::vector<Bytes>& others = {}) {
    CaptureWriter writer(path, ExistingRecording::Refused, std::string(modemOf));
    const auto modem = simulatedModem(modemOf, 1);
    for (SimulatedMessage next = modem->next(); next.at <= duration; next = modem->next()) {
      const auto milliseconds = next.at.count();
      writer.write({start + milliseconds / 1000, static_cast<std::int32_t>(milliseconds % 1000) * 1'000'000},
                   next.bytes);
    }
    std::int64_t second = start + duration.count();
    for (const Bytes& message : others) writer.write({++second, 0}, message);
  }

  const TemporaryFolder folder;
  const std::string path = folder.file("capture.pcapng");
  std::optional<CaptureHistory> history;
};

TEST_F(CaptureHistoryTest, HasTheNumbersAndEventsOfTheWholeCapture) {
  simulate(120s);
  CaptureHistory& whole = read();
  EXPECT_EQ(whole.remark(), "");
  EXPECT_FALSE(whole.progress());
  const auto stretch = whole.numbers().whole();
  EXPECT_EQ(stretch.begin, 0s);
  EXPECT_GE(stretch.end, 118s);
  EXPECT_EQ(whole.numbers().timeAt(0s).seconds, start);
  const auto series = whole.numbers().seriesOfKey("/SIM 1/LTE/Measurements/RSRP");
  ASSERT_TRUE(series);
  EXPECT_EQ(whole.numbers().unit(*series), "dBm");
  EXPECT_EQ(whole.numbers().name(*series), "RSRP");
  const auto samples = whole.numbers().samples(*series, stretch);
  ASSERT_THAT(samples, Not(IsEmpty()));
  for (const auto& sample : samples) {
    EXPECT_LT(sample.value, -30);
    EXPECT_GT(sample.value, -160);
  }
  EXPECT_THAT(whole.events().in(stretch), Not(IsEmpty()));
  EXPECT_EQ(whole.trends().name(), "capture.pcapng");
}

TEST_F(CaptureHistoryTest, WhatIsNoCaptureIsEmptyAndSaysWhy) {
  std::ofstream(path) << "no capture at all";
  EXPECT_TRUE(read().isEmpty());
  EXPECT_THAT(history->remark(), HasSubstr("The trends end where the file cannot be read any further: "));
}

TEST_F(CaptureHistoryTest, AMessageThatEndsTheDecoderEndsTheHistoryAlone) {
  // SIM information that is no property list.
  const Bytes unknown = PacketBuilder(0xFF0000, 20).fill(99).bytes();
  simulate(10s, technology::kalviLTE, {unknown, unknown, unknown, unknown});
  EXPECT_FALSE(read().isEmpty());
  EXPECT_THAT(history->remark(), HasSubstr("The trends end where the file cannot be read any further: "));
  EXPECT_LT(history->numbers().whole().end, 13s);
}

TEST_F(CaptureHistoryTest, AMissingProgramIsToldInASentence) {
  simulate(4s);
  history.emplace(CaptureHistory::Wish{.path = path, .program = "/nowhere/varnel-numbers"});
  EXPECT_TRUE(runUntil([this] { return !history->isReading(); }));
  EXPECT_THAT(history->remark(), HasSubstr("cannot be started"));
}

TEST_F(CaptureHistoryTest, OfManyErrorsTheLastOneIsToldInWholeCharacters) {
  const std::string program = folder.file("program");
  std::ofstream(program) << "#!/bin/sh\nyes 'program: an error' | head -n 100000 >&2\n"
                            "printf 'program: x%s\\n' $(yes é | head -n 400 | tr -d '\\n') >&2\nexit 1\n";
  std::filesystem::permissions(program, std::filesystem::perms::owner_all);
  history.emplace(CaptureHistory::Wish{.path = path, .program = program});
  EXPECT_TRUE(runUntil([this] { return !history->isReading(); }));
  std::string reason = "x";
  for (int i = 0; i < 249; ++i) reason += "é";
  EXPECT_EQ(history->remark(), "The trends end where the file cannot be read any further: " + reason);
}

TEST_F(CaptureHistoryTest, ClosingEndsTheProgramAtOnce) {
  simulate(600s);
  history.emplace(CaptureHistory::Wish{.path = path, .program = VARNEL_NUMBERS_PROGRAM});
  EXPECT_TRUE(runUntil([this] { return !history->isEmpty() || !history->isReading(); }));
  history.reset();
}

TEST_F(CaptureHistoryTest, TheProgramIsNotForUsers) {
  Process program(VARNEL_NUMBERS_PROGRAM, {});
  EXPECT_TRUE(program.waitForEnd());
  EXPECT_EQ(program.exitStatus(), 2);
  EXPECT_THAT(program.error(), HasSubstr("use varnel or varnel-decode"));
}

}  // namespace
}  // namespace varnel
