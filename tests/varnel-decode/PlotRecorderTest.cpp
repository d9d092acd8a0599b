#include "programs/varnel-decode/PlotRecorder.h"

#include <gmock/gmock.h>

#include <algorithm>

#include "base/Dictionary.h"

namespace varnel {

void PrintTo(const PlotPoint& point, std::ostream* out) {
  *out << point.seconds << " to " << point.until << ": " << point.lowest << ' ' << point.mean << ' '
       << point.highest << (point.startsNewLine ? " (new line)" : "");
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

enum class Line { GoesOn, Begins };

// A single value that was shown for a while.
PlotPoint held(double seconds, double until, double value, Line line) {
  return {seconds, until, value, value, value, line == Line::Begins};
}

TEST(PlotLine, OfAShortSequenceEachValueHoldsUntilTheNext) {
  PlotLine line;
  line.add(100, -80);
  line.add(102, -82);
  line.add(102.5, -82);
  EXPECT_THAT(line.points(),
              ElementsAre(held(100, 102, -80, Line::Begins), held(102, 102.5, -82, Line::GoesOn),
                          held(102.5, 102.5, -82, Line::GoesOn)));
}

TEST(PlotLine, NoLineCrossesATimeWithoutAValue) {
  PlotLine line;
  line.interrupt(98);
  line.add(100, 1);
  line.add(102, 2);
  line.interrupt(104);
  line.interrupt(106);
  line.add(108, 3);
  line.add(110, 4);
  line.interrupt(112);
  EXPECT_THAT(line.points(), ElementsAre(held(100, 102, 1, Line::Begins), held(102, 104, 2, Line::GoesOn),
                                         held(108, 110, 3, Line::Begins), held(110, 112, 4, Line::GoesOn)));
}

TEST(PlotLine, AColumnOfManyValuesKeepsLowestMeanAndHighest) {
  PlotLine line;
  // Columns of 2,000 s, so that each has a thousand values.
  for (int i = 0; i < 1'000'000; ++i) {
    const double value = i == 654'321 ? 1000 : i == 123'456 ? -1000 : i % 2;
    line.add(1e9 + 2.0 * i, value);
  }
  const auto points = line.points();
  EXPECT_LE(points.size(), 1000u);
  EXPECT_GE(points.size(), 500u) << "a column of the picture each";
  EXPECT_EQ(std::ranges::count(points, 1000, &PlotPoint::highest), 1);
  EXPECT_EQ(std::ranges::count(points, -1000, &PlotPoint::lowest), 1);
  const PlotPoint& ordinary = points[points.size() / 4];
  EXPECT_EQ(ordinary.lowest, 0);
  EXPECT_EQ(ordinary.mean, 0.5);
  EXPECT_EQ(ordinary.highest, 1);
  EXPECT_TRUE(std::ranges::is_sorted(points, {}, &PlotPoint::seconds));
  EXPECT_EQ(points.front().seconds, 1e9);
  EXPECT_EQ(points.back().until, 1e9 + 1'999'998);
  for (std::size_t i = 1; i < points.size(); ++i) ASSERT_EQ(points[i - 1].until, points[i].seconds) << i;
}

TEST(PlotLine, AGapClosesOnceItIsNarrowerThanAColumn) {
  const auto linesOf = [](int values) {
    PlotLine line;
    for (int i = 0; i < values; ++i) {
      line.add(4.0 * i, 1);
      line.interrupt(4.0 * i + 2);
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
    if (i == 2000) line.interrupt(4000);
  }
  const auto points = line.points();
  EXPECT_EQ(std::ranges::count(points, true, &PlotPoint::startsNewLine), 2);
  EXPECT_EQ(std::ranges::count(points, 4000, &PlotPoint::until), 1);
}

TEST(PlotLine, ATimeThatIsOvertakenIsShownWhereTheLineIs) {
  PlotLine line;
  line.add(100, 1);
  line.add(102, 2);
  line.add(92, 3);
  line.add(104, 4);
  EXPECT_THAT(line.points(),
              ElementsAre(held(100, 102, 1, Line::Begins), PlotPoint{102, 104, 2, 2.5, 3, false},
                          held(104, 104, 4, Line::GoesOn)));
}

TEST(PlotLine, AClockThatIsSetBackBeginsANewLine) {
  PlotLine line;
  line.add(5000, 1);
  line.add(5002, 2);
  line.add(1402, 3);
  line.add(1404, 4);
  EXPECT_THAT(line.points(),
              ElementsAre(held(5000, 5002, 1, Line::Begins), held(5002, 5002, 2, Line::GoesOn),
                          held(1402, 1404, 3, Line::Begins), held(1404, 1404, 4, Line::GoesOn)));
}

TEST(PlotLine, NoValueHoldsWhereTheClockLeapsAhead) {
  PlotLine line;
  line.add(100, 1);
  line.add(86'500, 2);
  line.add(86'500 + 86'401, 3);
  EXPECT_THAT(line.points(),
              ElementsAre(held(100, 86'500, 1, Line::Begins), held(86'500, 86'500, 2, Line::GoesOn),
                          held(172'901, 172'901, 3, Line::Begins)));
}

TEST(PlotLine, AClockThatJumpsToAndFroFillsNoMoreColumns) {
  PlotLine line;
  for (int i = 0; i < 10'000; ++i) line.add(i % 2 == 0 ? -62135596800.0 : 253402300799.0, i);
  EXPECT_LE(line.points().size(), 1000u);
}

TEST(PlotLine, AClockThatIsSetBackAgainAndAgainKeepsEachValueAtItsTime) {
  PlotLine line;
  for (int round = 0; round < 2000; ++round) {
    for (int i = 0; i < 50; ++i) line.add(1e9 - 3600.0 * round + 2.0 * i, i == 25 ? round : 0);
  }
  const auto points = line.points();
  EXPECT_LE(points.size(), 1000u);
  EXPECT_GE(points.size(), 500u);
  // Columns of two rounds each. The last peak belongs to the earliest times.
  EXPECT_EQ(points.back().highest, 1999);
  EXPECT_LE(points.back().seconds, 1e9 - 7'196'350 + 7200);
  EXPECT_EQ(std::ranges::count(points, 1999, &PlotPoint::highest), 1);
}

TEST(PlotLine, TimesFromEndToEndOfTheCalendarAreDrawn) {
  PlotLine line;
  for (int i = 0; i <= 2000; ++i) line.add(-62135596800.0 + i * 157'768'948.0, i);
  EXPECT_LE(line.points().size(), 1000u);
  EXPECT_EQ(line.points().back().highest, 2000);
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
  EXPECT_THAT(plot.series[0].points,
              ElementsAre(held(102.5, 104.5, -85, Line::Begins), held(104.5, 104.5, -86, Line::GoesOn)));
  EXPECT_EQ(plot.series[1].label, "Band");
  EXPECT_EQ(plot.series[1].unit, "");
  EXPECT_THAT(plot.series[1].points,
              ElementsAre(held(100.5, 102.5, 3, Line::Begins), held(102.5, 104.5, 7, Line::GoesOn)));
  EXPECT_FALSE(recorder.isEmpty());
}

// A display with a number under each of the paths. Each path names one section and one value.
Plot plotOf(const std::vector<std::pair<std::string, std::string>>& values) {
  std::vector<std::string> paths;
  Value display = Value::ofDictionary();
  for (const auto& [section, name] : values) {
    paths.push_back(section + '/' + name);
    if (!display.dictionary()->has(section)) display.dictionary()->set(section, Value::ofDictionary());
    display.dictionary()->get(section).dictionary()->set(name, "1");
  }
  PlotRecorder recorder(paths);
  recorder.take({{100, 0}, display});
  return recorder.plot("walk");
}

std::vector<std::string> labelsOf(const Plot& plot) {
  std::vector<std::string> labels;
  for (const PlotSeries& series : plot.series) labels.push_back(series.label);
  return labels;
}

TEST(PlotRecorder, TheSectionThatAllLabelsShareStandsInTheTitle) {
  const Plot shared = plotOf({{"Cell", "RSRP"}, {"Cell", "RSRQ"}});
  EXPECT_EQ(shared.title, "walk: Cell");
  EXPECT_THAT(labelsOf(shared), ElementsAre("RSRP", "RSRQ"));
  const Plot beginnings = plotOf({{"Cell A", "RSRP"}, {"Cell B", "RSRP"}});
  EXPECT_EQ(beginnings.title, "walk");
  EXPECT_THAT(labelsOf(beginnings), ElementsAre("Cell A/RSRP", "Cell B/RSRP"));
  EXPECT_THAT(labelsOf(plotOf({{"Cell", "RSRP"}})), ElementsAre("Cell/RSRP"));
}

TEST(PlotRecorder, ASelectionIsNotTakenApart) {
  Value record = Value::ofDictionary();
  record.dictionary()->set("a/b", "1");
  record.dictionary()->set("a/c", "1");
  record.dictionary()->set("x", "1");
  Value display = Value::ofDictionary();
  display.dictionary()->set("List", Value::ofArray({record}));
  PlotRecorder recorder({"List[a/b=1]/x", "List[a/c=1]/x"});
  recorder.take({{100, 0}, display});
  EXPECT_EQ(recorder.plot("walk").title, "walk: List");
  EXPECT_THAT(labelsOf(recorder.plot("walk")), ElementsAre("[a/b=1]/x", "[a/c=1]/x"));
}

TEST(PlotRecorder, LabelsAreCutAt200CharactersAndPrintable) {
  std::string euros;
  for (int i = 0; i < 100'000; ++i) euros += "\u20AC";
  const std::string shown = labelsOf(plotOf({{"A", "b"}, {"\x1B", euros}})).back();
  EXPECT_THAT(shown, ::testing::StartsWith("\\u001B/\u20AC\u20AC"));
  EXPECT_EQ(shown.size(), 6 + 1 + 198 * 3 + 3u) << "escape, slash, euros and an ellipsis";
  EXPECT_EQ(labelsOf(plotOf({{"A", std::string(198, 'x')}})).front().size(), 200u);
  EXPECT_EQ(labelsOf(plotOf({{"A", std::string(199, 'x')}})).front().size(), 203u);
  EXPECT_LT(labelsOf(plotOf({{"A", std::string(100'000, '\x80')}})).front().size(), 1000u);
}

TEST(PlotRecorder, APathWhoseValuesAreNoNumbersIsKnown) {
  Value display = Value::ofDictionary();
  display.dictionary()->set("State", "Idle");
  display.dictionary()->set("Level", "7");
  PlotRecorder recorder({"/State", "Level", "Missing"});
  recorder.take({{100, 0}, display});
  const auto unplotted = recorder.unplotted();
  ASSERT_EQ(unplotted.size(), 1u);
  EXPECT_EQ(unplotted[0].path, "State");
  EXPECT_EQ(unplotted[0].value, "Idle");
}

}  // namespace
}  // namespace varnel
