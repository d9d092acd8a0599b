#include "programs/varnel-decode/PlotRecorder.h"

#include <gmock/gmock.h>

#include <algorithm>

#include "base/Dictionary.h"

namespace varnel {

void PrintTo(const PlotPoint& point, std::ostream* out) {
  *out << point.seconds << ": " << point.value << (point.startsNewLine ? " (new line)" : "");
}

namespace {

using ::testing::ElementsAre;

struct Shown {
  const char* text;
  double number;
  const char* unit;
};

TEST(MeasurementIn, IsTheLeadingNumberAndItsUnit) {
  constexpr Shown shown[] = {
      {"-85 dBm", -85, "dBm"},
      {"12.50 dB", 12.5, "dB"},
      {"7", 7, ""},
      {"0", 0, ""},
      {"+3", 3, ""},
      {"  4 ms", 4, "ms"},
      {"50%", 50, "%"},
      {".5", 0.5, ""},
      {"-.25 dB", -0.25, "dB"},
      {"0x1F", 31, ""},
      {"3 km/h", 3, "km/h"},
      {"12/34", 12, ""},
      {"1 of 2", 1, ""},
      {"2024-03-01", 2024, ""},
      {"9 Number of Cells", 9, ""},
  };
  for (const auto& [text, number, unit] : shown) {
    const auto measurement = measurementIn(text);
    ASSERT_TRUE(measurement) << text;
    EXPECT_EQ(measurement->number, number) << text;
    EXPECT_EQ(measurement->unit, unit) << text;
  }
}

TEST(MeasurementIn, ATextWithoutALeadingNumberIsNone) {
  for (const char* text : {"", " ", "-", "+", "+-3", "--3", ".", "Band 7", "inf", "nan", "-inf", "infinity",
                           "0x", "0xG", "- 5", "(none)"}) {
    EXPECT_FALSE(measurementIn(text)) << text;
  }
}

TEST(PlotLine, AShortSequenceIsKeptWhole) {
  PlotLine line;
  line.add(100, -80);
  line.add(102, -82);
  line.add(102.5, -82);
  EXPECT_THAT(line.points(), ElementsAre(PlotPoint{100, -80, true}, PlotPoint{102, -82, false},
                                         PlotPoint{102.5, -82, false}));
}

TEST(PlotLine, NoLineCrossesATimeWithoutAValue) {
  PlotLine line;
  line.interrupt();
  line.add(100, 1);
  line.add(102, 2);
  line.interrupt();
  line.add(106, 3);
  line.add(108, 4);
  line.interrupt();
  EXPECT_THAT(line.points(), ElementsAre(PlotPoint{100, 1, true}, PlotPoint{102, 2, false},
                                         PlotPoint{106, 3, true}, PlotPoint{108, 4, false}));
}

TEST(PlotLine, ALongSequenceIsThinnedOutWithItsLowestAndHighest) {
  PlotLine line;
  for (int i = 0; i < 1'000'000; ++i) {
    const double value = i == 654'321 ? 1000 : i == 123'456 ? -1000 : i % 10;
    line.add(1e9 + 2.0 * i, value);
  }
  const auto points = line.points();
  EXPECT_LE(points.size(), 2000u);
  EXPECT_GE(points.size(), 1000u) << "a column of the picture each";
  EXPECT_EQ(std::ranges::count(points, PlotPoint{1e9 + 1'308'642, 1000, false}), 1);
  EXPECT_EQ(std::ranges::count(points, PlotPoint{1e9 + 246'912, -1000, false}), 1);
  EXPECT_TRUE(std::ranges::is_sorted(points, {}, &PlotPoint::seconds));
  EXPECT_EQ(points.front().seconds, 1e9);
}

TEST(PlotLine, AGapClosesOnceItIsNarrowerThanAColumn) {
  const auto linesOf = [](int values) {
    PlotLine line;
    for (int i = 0; i < values; ++i) {
      line.add(4.0 * i, 1);
      line.interrupt();
    }
    return std::ranges::count(line.points(), true, &PlotPoint::startsNewLine);
  };
  EXPECT_EQ(linesOf(1000), 1000);
  EXPECT_EQ(linesOf(5000), 1);
}

TEST(PlotLine, AGapThatIsWiderThanAColumnStays) {
  PlotLine line;
  for (int i = 0; i < 5000; ++i) {
    if (i < 2000 || i >= 2500) line.add(2.0 * i, 1);
    if (i == 2000) line.interrupt();
  }
  EXPECT_EQ(std::ranges::count(line.points(), true, &PlotPoint::startsNewLine), 2);
}

TEST(PlotLine, WhatAClockThatWasSetBackDatesStandsAtItsTime) {
  PlotLine line;
  line.add(100, 1);
  line.add(102, 2);
  line.add(50, 3);
  line.add(104, 4);
  EXPECT_THAT(line.points(), ElementsAre(PlotPoint{50, 3, true}, PlotPoint{100, 1, false},
                                         PlotPoint{102, 2, false}, PlotPoint{104, 4, false}));
}

TEST(PlotLine, AClockThatIsSetBackAgainAndAgainKeepsLowestAndHighestOfEachColumn) {
  PlotLine line;
  for (int round = 0; round < 2000; ++round) {
    for (int i = 0; i < 50; ++i) line.add(1e9 - 3600.0 * round + 2.0 * i, i == 25 ? round : 0);
  }
  const auto points = line.points();
  EXPECT_LE(points.size(), 2000u);
  EXPECT_GE(points.size(), 500u);
  EXPECT_TRUE(std::ranges::is_sorted(points, {}, &PlotPoint::seconds));
  const auto isLastPeak = [](const PlotPoint& point) {
    return point.value == 1999 && point.seconds == 1e9 - 7'196'350;
  };
  EXPECT_EQ(std::ranges::count_if(points, isLastPeak), 1);
}

TEST(PlotLine, TimesFromEndToEndOfTheCalendarAreDrawn) {
  PlotLine line;
  for (int i = 0; i <= 2000; ++i) line.add(-62135596800.0 + i * 157'768'948.0, i);
  EXPECT_LE(line.points().size(), 2000u);
  EXPECT_EQ(line.points().back().value, 2000);
}

TEST(PlotRecorder, EachPathIsASeriesWithTheUnitOfItsFirstNumber) {
  PlotRecorder recorder({"Level", "/Band", "None"});
  EXPECT_TRUE(recorder.isEmpty());
  const auto show = [&](Time time, const char* level, const char* band) {
    Value display = Value::ofDictionary();
    display.dictionary()->set("Level", level);
    display.dictionary()->set("Band", band);
    recorder.take({time, display});
  };
  show({100, 500'000'000}, "unknown", "3");
  show({102, 500'000'000}, "-85 dBm", "7");
  show({104, 500'000'000}, "-86", "");
  const Plot plot = recorder.plot("walk.pcap");
  EXPECT_EQ(plot.title, "walk.pcap");
  ASSERT_EQ(plot.series.size(), 2u) << "a path without a number has no line";
  EXPECT_EQ(plot.series[0].label, "Level");
  EXPECT_EQ(plot.series[0].unit, "dBm");
  EXPECT_THAT(plot.series[0].points, ElementsAre(PlotPoint{102.5, -85, true}, PlotPoint{104.5, -86, false}));
  EXPECT_EQ(plot.series[1].label, "Band");
  EXPECT_EQ(plot.series[1].unit, "");
  EXPECT_THAT(plot.series[1].points, ElementsAre(PlotPoint{100.5, 3, true}, PlotPoint{102.5, 7, false}));
  EXPECT_FALSE(recorder.isEmpty());
}

}  // namespace
}  // namespace varnel
