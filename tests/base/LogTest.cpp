#include "base/Log.h"

#include <gtest/gtest.h>

#include <bit>
#include <cstdint>
#include <limits>
#include <string>
#include <utility>
#include <vector>

using namespace varnel;

namespace {

class Log : public testing::Test, protected LogSink {
 protected:
  Log() { setLogSink(this, 255); }
  ~Log() override { setLogSink(nullptr, 0); }

  void write(int priority, std::string_view text) override { _lines.emplace_back(priority, text); }

  // The text of the only line since the last call.
  std::string line() {
    EXPECT_EQ(_lines.size(), 1U);
    std::string text = _lines.empty() ? "no line" : _lines.back().second;
    _lines.clear();
    return text;
  }

  std::vector<std::pair<int, std::string>> _lines;
};

// Counts how often it is turned into text.
class Counting {
 public:
  explicit Counting(int& count) : _count(count) {}
  operator std::string_view() const {
    ++_count;
    return "counted";
  }

 private:
  int& _count;
};

}  // namespace

TEST_F(Log, PlainTextIsPassedOn) {
  logError("no conversion");
  EXPECT_EQ(line(), "no conversion");
  logError("");
  EXPECT_EQ(line(), "");
  logError("ends in a newline\n");
  EXPECT_EQ(line(), "ends in a newline\n");
}

TEST_F(Log, DecimalsAreSigned) {
  logError("%d", 0);
  EXPECT_EQ(line(), "0");
  logError("%d", -5);
  EXPECT_EQ(line(), "-5");
  logError("Array Count: %d", 3U);
  EXPECT_EQ(line(), "Array Count: 3");
  logError("%d", std::uint32_t{45249});
  EXPECT_EQ(line(), "45249");
  logError("%d", std::uint16_t{45249});
  EXPECT_EQ(line(), "45249");
  logError("%d", std::uint32_t{0xFFFFFFFF});
  EXPECT_EQ(line(), "-1");
  logError("%d", std::uint32_t{0x80000000});
  EXPECT_EQ(line(), "-2147483648");
  logError("%d", std::int8_t{-1});
  EXPECT_EQ(line(), "-1");
  logError("%d", std::uint8_t{255});
  EXPECT_EQ(line(), "255");
  logError("%d", true);
  EXPECT_EQ(line(), "1");
}

TEST_F(Log, UnsignedAndHexadecimalsHave32Bits) {
  logError("%u", std::uint32_t{0xFFFFFFFF});
  EXPECT_EQ(line(), "4294967295");
  logError("%u", -1);
  EXPECT_EQ(line(), "4294967295");
  logError("%x", std::uint32_t{0xB0C2});
  EXPECT_EQ(line(), "b0c2");
  logError("%x", -1);
  EXPECT_EQ(line(), "ffffffff");
  logError("%x", 0);
  EXPECT_EQ(line(), "0");
}

TEST_F(Log, LongDecimalsHave64Bits) {
  logError("Class Index: %ld", 1L);
  EXPECT_EQ(line(), "Class Index: 1");
  logError("%ld", std::int64_t{-9223372036854775807} - 1);
  EXPECT_EQ(line(), "-9223372036854775808");
  logError("%ld", std::uint32_t{0xFFFFFFFF});
  EXPECT_EQ(line(), "4294967295");
  logError("%ld", -1);
  EXPECT_EQ(line(), "-1");
}

TEST_F(Log, RealsHaveSixDecimals) {
  logError("%lf", 1.5);
  EXPECT_EQ(line(), "1.500000");
  logError("%lf", -0.0000005);
  EXPECT_EQ(line(), "-0.000000");
  logError("%lf", 1e22);
  EXPECT_EQ(line(), "10000000000000000000000.000000");
  logError("%lf", -std::numeric_limits<double>::max());
  EXPECT_EQ(line().size(), 317U);
  logError("%lf", std::numeric_limits<double>::infinity());
  EXPECT_EQ(line(), "inf");
}

TEST_F(Log, PointersAreHexadecimal) {
  logError("Creating Log object: %p", std::bit_cast<const void*>(std::uintptr_t{0x7F00A0B0}));
  EXPECT_EQ(line(), "Creating Log object: 0x7f00a0b0");
  int* typed = std::bit_cast<int*>(std::uintptr_t{0x10});
  logError("%p", typed);
  EXPECT_EQ(line(), "0x10");
}

TEST_F(Log, NullPointersPrintAsZero) {
  const void* nothing = nullptr;
  logError("%p", nothing);
  EXPECT_EQ(line(), "0x0");
  const int* nowhere = nullptr;
  logError("at %p end", nowhere);
  EXPECT_EQ(line(), "at 0x0 end");
}

TEST_F(Log, TextsOfEveryTypeFit) {
  logError("%s", "literal");
  EXPECT_EQ(line(), "literal");
  logError("%s", std::string("string"));
  EXPECT_EQ(line(), "string");
  logError("%s", std::string_view("view of it").substr(0, 4));
  EXPECT_EQ(line(), "view");
  const char* pointer = "pointer";
  logError("%s", pointer);
  EXPECT_EQ(line(), "pointer");
  logError("%s", "");
  EXPECT_EQ(line(), "");
}

TEST_F(Log, ArgumentsKeepTheirPlaces) {
  logError("%s=%d, %x and %ld at %p: %lf%s", "name", -1, 255U, 5L, static_cast<const void*>(nullptr), 2.5,
           "!");
  EXPECT_EQ(line(), "name=-1, ff and 5 at 0x0: 2.500000!");
}

TEST_F(Log, PercentSignsOfArgumentsAreText) {
  logError("%s%d", "100%d %s", 7);
  EXPECT_EQ(line(), "100%d %s7");
}

TEST_F(Log, LongTextsAreNotCut) {
  const std::string text(100000, 'x');
  logError("<%s>", text);
  EXPECT_EQ(line(), "<" + text + ">");
}

TEST_F(Log, PrioritiesAreThoseOfSyslog) {
  logError("error");
  logWarning("warning");
  logLine(logNoticePriority, "notice");
  logLine(logExportFailurePriority, "export");
  const std::vector<std::pair<int, std::string>> expected{
      {3, "error"}, {4, "warning"}, {5, "notice"}, {16, "export"}};
  EXPECT_EQ(_lines, expected);
}

TEST_F(Log, LevelsAboveTheHighestAreNotTaken) {
  setLogSink(this, 4);
  EXPECT_TRUE(logTakes(0));
  EXPECT_TRUE(logTakes(4));
  EXPECT_FALSE(logTakes(5));
  logLine(logNoticePriority, "notice");
  logWarning("warning");
  EXPECT_EQ(line(), "warning");
}

TEST_F(Log, ALineThatNobodyTakesIsNotFormatted) {
  int count = 0;
  const Counting argument(count);
  setLogSink(this, 3);
  logWarning("%s", argument);
  EXPECT_EQ(count, 0);
  logError("%s", argument);
  EXPECT_EQ(count, 1);
  EXPECT_EQ(line(), "counted");
}

TEST_F(Log, ANullSinkTakesNothing) {
  setLogSink(nullptr, 255);
  EXPECT_EQ(logSink(), nullptr);
  EXPECT_FALSE(logTakes(0));
  logError("lost %d", 1);
  EXPECT_TRUE(_lines.empty());
}

TEST_F(Log, TheSinkIsTheOneThatWasSet) { EXPECT_EQ(logSink(), static_cast<LogSink*>(this)); }
