#include "programs/shared/OfflineDecoder.h"

#include <gmock/gmock.h>

#include <csignal>
#include <cstdint>
#include <cstdlib>
#include <limits>
#include <ostream>
#include <string>
#include <vector>

#include "platform/ApplicationInfo.h"

namespace varnel {

namespace {

using ::testing::ElementsAre;

struct NoResources final : Resources {
  Value propertyList(std::string_view /*name*/) const override { return {}; }
  std::vector<std::string> propertyListPaths() const override { return {}; }
};

std::string text(Time time) {
  std::string nanoseconds = std::to_string(time.nanoseconds);
  nanoseconds.insert(0, 9 - nanoseconds.size(), '0');
  return std::to_string(time.seconds) + "." + nanoseconds;
}

// Notes every call with the time of the clock. It keeps a history, so that tests see the dates.
class RecordingGenerator final : public LogGenerator {
 public:
  explicit RecordingGenerator(const Services& services) : LogGenerator(services) {}

  void updateState_withData(Dictionary& state, ByteView data) override {
    const std::string message(data.begin(), data.end());
    if (message == "raise") throw ArrayOutOfBounds();
    calls.push_back("message " + message + " at " + text(services().clock.now()));
    state.set("DisplayState", message);
    state.set("Display", Value::ofDictionary());
    state.set("ExtraInfo", Value::ofDictionary());
  }
  Value generateLogUsingState(Dictionary& state) override {
    calls.push_back("display at " + text(services().clock.now()));
    updateHistoryInState(state);
    return Value("display " + std::to_string(++displays));
  }
  Value getStartCommand() const override { return {}; }
  Value getSaveContentsFromState(const Dictionary& state) const override { return state.get("History"); }

  void keepNoRawBytes() override { calls.emplace_back("no raw bytes"); }

  struct ArrayOutOfBounds {};
  std::vector<std::string> calls;
  int displays = 0;
};

class OfflineDecoderTest : public ::testing::Test {
 protected:
  void deliver(Time time, std::string_view message = "m") {
    decoder.deliver(time, {reinterpret_cast<const std::uint8_t*>(message.data()), message.size()});
  }

  CaptureClock clock;
  NoResources resources;
  ApplicationInfo application;
  std::ostream nowhere{nullptr};
  RecordingGenerator generator{{resources, clock, application, nowhere}};
  OfflineDecoder decoder{generator, clock, RawBytes::Kept};
};

constexpr std::int64_t earliest = std::numeric_limits<std::int64_t>::min();
constexpr std::int64_t latest = std::numeric_limits<std::int64_t>::max();

TEST_F(OfflineDecoderTest, WithoutARecordOneDisplayIsGeneratedIn1970) {
  EXPECT_EQ(*decoder.finish().string(), "display 1");
  EXPECT_THAT(generator.calls, ElementsAre("display at 0.000000000"));
}

TEST_F(OfflineDecoderTest, ARecordIsDeliveredAtItsOwnTimeAndTheLastDisplayGeneratedThen) {
  deliver({100, 5}, "a");
  decoder.finish();
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000005", "display at 100.000000005"));
}

TEST_F(OfflineDecoderTest, ATickFiresTwoSecondsAfterTheFirstRecord) {
  deliver({100, 250}, "a");
  deliver({103, 0}, "b");
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000250", "display at 102.000000250",
                                           "message b at 103.000000000"));
}

TEST_F(OfflineDecoderTest, ATickAtTheRecordsVeryTimeFiresBeforeIt) {
  deliver({100, 250}, "a");
  deliver({102, 250}, "b");
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000250", "display at 102.000000250",
                                           "message b at 102.000000250"));
}

TEST_F(OfflineDecoderTest, ATickOneNanosecondAfterTheRecordDoesNotFire) {
  deliver({100, 250}, "a");
  deliver({102, 249}, "b");
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000250", "message b at 102.000000249"));
}

TEST_F(OfflineDecoderTest, TicksKeepTheGridOfTheFirstRecord) {
  deliver({100, 0}, "a");
  deliver({103, 900'000'000}, "b");
  deliver({104, 0}, "c");
  decoder.finish();
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000000", "display at 102.000000000",
                                           "message b at 103.900000000", "display at 104.000000000",
                                           "message c at 104.000000000", "display at 104.000000000"));
}

TEST_F(OfflineDecoderTest, OnlyTheFirstOfSeveralDueTicksFindsAMessage) {
  deliver({100, 0}, "a");
  deliver({111, 0}, "b");
  deliver({112, 0}, "c");
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000000", "display at 102.000000000",
                                           "message b at 111.000000000", "display at 112.000000000",
                                           "message c at 112.000000000"));
}

TEST_F(OfflineDecoderTest, TicksFiredAheadOfAMessageYieldWhatTheFirstGeneratesAndAreNotFiredAgain) {
  EXPECT_FALSE(decoder.hasStarted());
  EXPECT_FALSE(decoder.fireTicks({100, 5}));
  deliver({100, 5}, "a");
  EXPECT_TRUE(decoder.hasStarted());
  EXPECT_FALSE(decoder.fireTicks({102, 4}));
  const auto generation = decoder.fireTicks({111, 0});
  ASSERT_TRUE(generation);
  EXPECT_EQ(text(generation->time), "102.000000005");
  EXPECT_EQ(*generation->display.string(), "display 1");
  deliver({111, 0}, "b");
  EXPECT_TRUE(decoder.fireTicks({112, 5}));
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000005", "display at 102.000000005",
                                           "message b at 111.000000000", "display at 112.000000005"));
}

TEST_F(OfflineDecoderTest, RecordsOfOneTimeAreOneInterval) {
  deliver({100, 0}, "a");
  deliver({100, 0}, "b");
  decoder.finish();
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000000", "message b at 100.000000000",
                                           "display at 100.000000000"));
}

TEST_F(OfflineDecoderTest, ATickFiresOnceEvenWhenTimeGoesBack) {
  deliver({100, 0}, "a");
  deliver({105, 0}, "b");
  deliver({99, 0}, "c");
  deliver({105, 999'999'999}, "d");
  deliver({106, 0}, "e");
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000000", "display at 102.000000000",
                                           "message b at 105.000000000", "message c at 105.000000000",
                                           "message d at 105.999999999", "display at 106.000000000",
                                           "message e at 106.000000000"));
}

TEST_F(OfflineDecoderTest, TimesFromEndToEndOfTheCalendarAreOneStep) {
  deliver({earliest, 1}, "a");
  deliver({latest, 0}, "b");
  deliver({latest, 2}, "c");
  decoder.finish();
  EXPECT_THAT(
      generator.calls,
      ElementsAre("message a at -9223372036854775808.000000001", "display at -9223372036854775806.000000001",
                  "message b at 9223372036854775807.000000000", "message c at 9223372036854775807.000000002",
                  "display at 9223372036854775807.000000002"));
}

TEST_F(OfflineDecoderTest, ARecordDatedUpToTenSecondsBeforeCountsAsOfTheTimeBefore) {
  deliver({100, 5}, "a");
  deliver({90, 5}, "b");
  deliver({91, 0}, "c");
  deliver({101, 0}, "d");
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000005", "message b at 100.000000005",
                                           "message c at 100.000000005", "message d at 101.000000000"));
  EXPECT_EQ(decoder.clockSteps().count, 0u);
}

TEST_F(OfflineDecoderTest, AClockSetBackFiresOneTickAndTheTimerStartsAnewThere) {
  deliver({100, 5}, "a");
  deliver({90, 4}, "b");
  deliver({92, 3}, "c");
  deliver({92, 4}, "d");
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000005", "display at 102.000000005",
                                           "message b at 90.000000004", "message c at 92.000000003",
                                           "display at 92.000000004", "message d at 92.000000004"));
}

TEST_F(OfflineDecoderTest, AClockAheadByMoreThanADayFiresOneTickAndTheTimerStartsAnewThere) {
  deliver({100, 0}, "a");
  deliver({86500, 1}, "b");
  deliver({86502, 0}, "c");
  deliver({86502, 1}, "d");
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000000", "display at 102.000000000",
                                           "message b at 86500.000000001", "message c at 86502.000000000",
                                           "display at 86502.000000001", "message d at 86502.000000001"));
}

TEST_F(OfflineDecoderTest, APauseOfADayKeepsTheGrid) {
  deliver({100, 0}, "a");
  deliver({86500, 0}, "b");
  deliver({86501, 999'999'999}, "c");
  deliver({86502, 0}, "d");
  EXPECT_THAT(generator.calls, ElementsAre("message a at 100.000000000", "display at 102.000000000",
                                           "message b at 86500.000000000", "message c at 86501.999999999",
                                           "display at 86502.000000000", "message d at 86502.000000000"));
  EXPECT_EQ(decoder.clockSteps().count, 0u);
}

TEST_F(OfflineDecoderTest, AClockThatStandsStillAfterItWasSetBackFiresOneTick) {
  deliver({5000, 0}, "a");
  for (int i = 0; i < 3; ++i) deliver({1400, 0}, "b");
  EXPECT_THAT(generator.calls, ElementsAre("message a at 5000.000000000", "display at 5002.000000000",
                                           "message b at 1400.000000000", "message b at 1400.000000000",
                                           "message b at 1400.000000000"));
}

TEST_F(OfflineDecoderTest, AClockThatGoesBackAnHourEvery100RecordsLosesNoDisplay) {
  constexpr int rounds = 50, recordsARound = 100;
  int generations = 0;
  for (int round = 0; round < rounds; ++round) {
    for (int i = 0; i < recordsARound; ++i) {
      const Time time{1'000'000 - round * 3600 + i / 10, i % 10 * 100'000'000};
      if (decoder.fireTicks(time)) ++generations;
      deliver(time);
    }
  }
  // Each round takes 9.9 s: four regular ticks, and one when the clock is set.
  EXPECT_EQ(generations, rounds * 5 - 1);
  EXPECT_EQ(decoder.clockSteps().count, 49u);
}

TEST_F(OfflineDecoderTest, TheFirstStepOfTheClockIsToldWithItsTimes) {
  for (const std::int64_t second : {100, 105, 50, 90'000, 200'000}) deliver({second, 7});
  const ClockSteps& steps = decoder.clockSteps();
  EXPECT_EQ(steps.count, 3u);
  EXPECT_EQ(steps.from, (Time{105, 7}));
  EXPECT_EQ(steps.to, (Time{50, 7}));
}

TEST_F(OfflineDecoderTest, AClockSetFromTheEndOfTimeToItsBeginningFiresOneTickAtTheEnd) {
  deliver({latest, 0}, "a");
  deliver({earliest, 0}, "b");
  EXPECT_THAT(generator.calls, ElementsAre("message a at 9223372036854775807.000000000",
                                           "display at 9223372036854775807.000000000",
                                           "message b at -9223372036854775808.000000000"));
}

TEST_F(OfflineDecoderTest, RawBytesAreKeptOnlyWhereTheyAreAskedFor) {
  EXPECT_THAT(generator.calls, ElementsAre());
  OfflineDecoder(generator, clock, RawBytes::NotKept);
  EXPECT_THAT(generator.calls, ElementsAre("no raw bytes"));
}

TEST_F(OfflineDecoderTest, TheLastDisplayIsTheOneReturned) {
  deliver({100, 0});
  deliver({102, 0});
  deliver({104, 0});
  EXPECT_EQ(*decoder.finish().string(), "display 3");
}

TEST_F(OfflineDecoderTest, HistoryRecordsCarryTheTimesOfTheirTicksAndOfTheLastRecord) {
  deliver({1709301909, 500'000'000});  // 2024-03-01 14:05:09.5
  deliver({1709301914, 0});
  decoder.finish();
  const Value contents = decoder.saveContents();
  ASSERT_TRUE(contents.array());
  ASSERT_EQ(contents.array()->size(), 2u);
  EXPECT_EQ(*(*contents.array())[0].dictionary()->get("Date").string(), "2024-03-01 14:05:11 +0000");
  EXPECT_EQ(*(*contents.array())[1].dictionary()->get("Date").string(), "2024-03-01 14:05:14 +0000");
}

TEST_F(OfflineDecoderTest, TheCaptureClocksZoneIsUTCWithoutDaylightTime) {
  deliver({1720000000, 0});  // in July
  EXPECT_EQ(clock.zoneAt(clock.now()).offsetSeconds, 0);
  EXPECT_FALSE(clock.zoneAt(clock.now()).daylight);
}

TEST_F(OfflineDecoderTest, AMessageIsHandedOverByteForByte) {
  deliver({100, 0}, std::string_view("\0\xFF\n", 3));
  deliver({100, 0}, "");
  EXPECT_THAT(generator.calls,
              ElementsAre(std::string("message \0\xFF\n at 100.000000000", 28), "message  at 100.000000000"));
}

using OfflineDecoderDeathTest = OfflineDecoderTest;

TEST_F(OfflineDecoderDeathTest, AnExceptionOfADecoderEndsTheProgram) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  const auto deliverAndCatch = [this] {
    try {
      deliver({100, 0}, "raise");
    } catch (...) {
      std::exit(0);
    }
  };
  EXPECT_EXIT(deliverAndCatch(), ::testing::KilledBySignal(SIGABRT), "");
}

}  // namespace

}  // namespace varnel
