#include <gmock/gmock.h>
#include <sys/stat.h>

#include <csignal>

#include "host/captures/PcapEncoders.h"
#include "tests/varnel-decode/DecodeProgram.h"

// Runs the whole program: displays over time, and what becomes of messages.

namespace varnel {
namespace {

using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::StartsWith;

using DecodeGenerations = DecodeProgram;

// Antennas at 14:05:09.5, 14:05:10 and 14:05:14, so ticks at :11.5 and :13.5.
std::string threeRecords() {
  return pcapHeader() + pcapRecord(afternoon, 500'000'000, antennas(2)) +
         pcapRecord(afternoon + 1, 0, antennas(4)) + pcapRecord(afternoon + 5, 0, antennas(8));
}

TEST_F(DecodeGenerations, EveryWritesALineForEachTickThatFindsMessagesAndOneForTheEnd) {
  const Result result = decode(threeRecords(), {"--every"});
  EXPECT_EQ(result.status, 0) << result.error;
  ASSERT_EQ(linesOf(result.output), 2u) << result.output;
  const std::string second = result.output.substr(result.output.find('\n') + 1);
  EXPECT_THAT(result.output, StartsWith("{\"Time\":\"2024-03-01T14:05:11.500Z\",\"Display\":{"));
  EXPECT_THAT(result.output.substr(0, result.output.find('\n')), HasSubstr(R"("Num Tx Antennas":"4")"));
  EXPECT_THAT(second, StartsWith("{\"Time\":\"2024-03-01T14:05:14.000Z\",\"Display\":{"));
  EXPECT_THAT(second, HasSubstr(R"("Num Tx Antennas":"8")"));
  EXPECT_EQ(decode(threeRecords(), {"--every", "--format", "json"}).output, result.output);
}

TEST_F(DecodeGenerations, ACaptureWithoutRecordsHasNone) {
  EXPECT_EQ(decode(pcapHeader(), {"--every"}).output, "");
  EXPECT_EQ(decode(pcapHeader(), {"--csv", "Serving Cell Info/Num Tx Antennas"}).output,
            "Time,Serving Cell Info/Num Tx Antennas\n");
}

TEST_F(DecodeGenerations, CsvHasARowForEachDisplay) {
  const Result result =
      decode(threeRecords(), {"--log-level", "-1", "--csv", "Serving Cell Info/Num Tx Antennas",
                              "/Serving Cell Info/Num Tx Antennas", "Serving Cell Info"});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.output,
            "Time,Serving Cell Info/Num Tx Antennas,Serving Cell Info/Num Tx Antennas,Serving Cell Info\n"
            "2024-03-01T14:05:11.500Z,4,4,\n"
            "2024-03-01T14:05:14.000Z,8,8,\n");
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_THAT(result.error, HasSubstr("'Serving Cell Info'")) << "a section has no value";
}

TEST_F(DecodeGenerations, AMistypedPathIsToldWithTheNearestOnes) {
  const Result result =
      decode(threeRecords(), {"--csv", "Serving Cell Info/Num Antennas", "Serving Cell/X[Y=1"});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error,
            "varnel-decode: no display of " + folder.file("capture") +
                " has a value under 'Serving Cell Info/Num Antennas'; did you mean "
                "'Serving Cell Info/Num Tx Antennas'?\n"
                "varnel-decode: no display of " +
                folder.file("capture") +
                " has a value under 'Serving Cell/X[Y=1'; --format paths shows what there is\n");
}

TEST_F(DecodeGenerations, CsvFollowsARowByItsValue) {
  const auto row = [](const std::string& id, const std::string& level) {
    return "<dict><key>ID</key><string>" + id + "</string><key>Level</key><string>" + level +
           "</string></dict>";
  };
  const auto rows = [](const std::string& content) { return pdpContexts("<array>" + content + "</array>"); };
  const Result result = decode(pcapHeader() + pcapRecord(afternoon, 0, rows(row("7", "a") + row("16", "b"))) +
                                   pcapRecord(afternoon + 2, 0, rows(row("16", "c") + row("16", "d"))) +
                                   pcapRecord(afternoon + 4, 0, rows(row("8", "e"))),
                               {"--csv", "PDP Context Info[ID=16]/Level", "PDP Context Info/0/Level"});
  EXPECT_EQ(result.output,
            "Time,PDP Context Info[ID=16]/Level,PDP Context Info/0/Level\n"
            "2024-03-01T14:05:11.000Z,b,a\n"
            "2024-03-01T14:05:13.000Z,c,c\n"
            "2024-03-01T14:05:13.000Z,,e\n");
}

TEST_F(DecodeGenerations, CsvTakesCapturesBeforeItOrBehindADoubleDash) {
  const std::string path = write("capture", threeRecords());
  const std::string antennasPath = "Serving Cell Info/Num Tx Antennas";
  const std::string expected = "Time," + antennasPath +
                               "\n"
                               "2024-03-01T14:05:11.500Z,4\n"
                               "2024-03-01T14:05:14.000Z,8\n";
  EXPECT_EQ(run({"--technology", "kalvi-lte", path, "--csv", antennasPath}).output, expected);
  EXPECT_EQ(run({"--technology", "kalvi-lte", "--csv", antennasPath, "--", path}).output, expected);
}

// The serving cell's average RSRP in steps of a quarter above -140 dBm, from bit 1 of byte 22.
std::string averageRsrp(int steps) {
  std::string payload(33 - 13, '\0');
  payload[22 - 13] = static_cast<char>(steps << 1 & 0xFF);
  payload[23 - 13] = static_cast<char>(steps >> 7);
  return packet(1, 0xB17F, payload);
}

// -93.25 dBm, the same again, then -93.00 dBm.
std::string threeMeasurements() {
  return pcapHeader() + pcapRecord(afternoon, 0, averageRsrp(187)) +
         pcapRecord(afternoon + 2, 0, averageRsrp(187)) + pcapRecord(afternoon + 4, 0, averageRsrp(188));
}

TEST_F(DecodeGenerations, NumbersOfCsvArePlainAndTheHeaderHasTheUnit) {
  const Result result =
      decode(threeMeasurements(), {"--numbers", "--csv", "Serving Cell Measurements/Average RSRP",
                                   "Serving Cell Info/Num Tx Antennas", "--"});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(result.output,
            "Time,Serving Cell Measurements/Average RSRP [dBm],Serving Cell Info/Num Tx Antennas\n"
            "2024-03-01T14:05:11.000Z,-93.25,\n"
            "2024-03-01T14:05:13.000Z,-93.25,\n"
            "2024-03-01T14:05:13.000Z,-93.00,\n");
}

std::string recordOf(const char* technology) {
  PcapngWriter writer(technology);
  const ByteView beginning = writer.beginning();
  std::string text(beginning.begin(), beginning.end());
  const Bytes message{1, 13, 0, 0xC1, 0xB0, 0, 0, 0, 0, 0, 0, 0, 0};
  const ByteView record = writer.encode({{afternoon, 0}, Dating::Known, message, {}});
  return text.append(record.begin(), record.end());
}

TEST_F(DecodeGenerations, UnitsAreThoseOfTheTechnologyThatTheCaptureNames) {
  const std::string path = "Serving Cell Measurements/Average RSRP";
  const std::string lte = write("lte", recordOf("kalvi-lte")),
                    utran = write("utran", recordOf("kalvi-utran-2"));
  const auto table = [&](std::vector<std::string> captures) {
    captures.insert(captures.begin(), {"--numbers", "--csv", path, "--"});
    return run(captures).output;
  };
  EXPECT_THAT(table({lte}), StartsWith("Time," + path + " [dBm]\n"));
  EXPECT_THAT(table({utran}), StartsWith("Time," + path + "\n")) << "which has no such entry";
  EXPECT_THAT(table({lte, utran}), StartsWith("Capture,Time," + path + " [dBm]\n"));
  EXPECT_THAT(table({utran, utran}), StartsWith("Capture,Time," + path + "\n"));
  const Result overruled = run({"--technology", "kalvi-lte", "--numbers", "--csv", path, "--", utran, utran});
  EXPECT_THAT(overruled.output, StartsWith("Capture,Time," + path + " [dBm]\n"));
}

TEST_F(DecodeGenerations, ASelectedRecordHasTheUnitOfItsList) {
  const Result result =
      decode(threeMeasurements(),
             {"--numbers", "--csv", "Neighbor Cells List[Physical Cell ID=16]/Measured RSRP", "--"});
  EXPECT_THAT(result.output,
              StartsWith("Time,Neighbor Cells List[Physical Cell ID=16]/Measured RSRP [dBm]\n"));
}

TEST_F(DecodeGenerations, NumbersOfJsonHaveTheirUnitsApart) {
  const Result result = decode(threeMeasurements(), {"--numbers", "--every"});
  EXPECT_EQ(result.status, 0) << result.error;
  ASSERT_EQ(linesOf(result.output), 3u);
  EXPECT_THAT(result.output, HasSubstr("\"Average RSRP\":-93.25,"));
  EXPECT_THAT(result.output, HasSubstr("\"Average RSRP\":-93.00,"));
  EXPECT_THAT(result.output,
              HasSubstr("\"Units\":{\"Serving Cell Measurements\":{\"Measured RSRP\":\"dBm\","));
}

TEST_F(DecodeGenerations, ChangesLeaveOutWhatIsAsItWas) {
  const Result table = decode(threeMeasurements(), {"--changes", "--numbers", "--csv",
                                                    "Serving Cell Measurements/Average RSRP", "--"});
  EXPECT_EQ(table.output,
            "Time,Serving Cell Measurements/Average RSRP [dBm]\n"
            "2024-03-01T14:05:11.000Z,-93.25\n"
            "2024-03-01T14:05:13.000Z,-93.00\n");
  const Result json = decode(threeMeasurements(), {"--changes", "--numbers", "--every"});
  ASSERT_EQ(linesOf(json.output), 2u) << json.output;
  EXPECT_EQ(json.output.substr(json.output.find('\n') + 1),
            "{\"Time\":\"2024-03-01T14:05:13.000Z\",\"Display\":{\"Serving Cell Measurements\":"
            "{\"Average RSRP\":-93.00}}}\n");
}

TEST_F(DecodeGenerations, ChangesBeginAnewWithEachCapture) {
  const std::string one = write("one", threeMeasurements()), other = write("other", threeMeasurements());
  const Result result = run({"--technology", "kalvi-lte", "--jobs", "2", "--every", "--changes", one, other});
  EXPECT_EQ(result.status, 0) << result.error;
  ASSERT_EQ(linesOf(result.output), 4u) << result.output;
  const std::string start = "{\"Capture\":\"" + other + "\",\"Time\":\"2024-03-01T14:05:1";
  EXPECT_THAT(result.output, HasSubstr(start + "1.000Z\",\"Display\":{\"Serving Cell Info\":{"));
  EXPECT_THAT(result.output, HasSubstr(start + "3.000Z\",\"Display\":{\"Serving Cell Measurements\":"
                                               "{\"Average RSRP\":\"-93.00 dBm\"}}}\n"));
}

TEST_F(DecodeGenerations, NumbersAndChangesNeedSomethingToWriteThemIn) {
  for (const char* option : {"--numbers", "--changes"}) {
    for (const char* other : {"--format=json", "--stats"}) {
      const Result result = decode(threeMeasurements(), {option, other});
      EXPECT_EQ(result.status, 2);
      EXPECT_THAT(result.error, HasSubstr(std::string(option) + " goes with --every or --csv"));
    }
  }
}

// A log record without anything around it, from a modem that knows no date, this long after its start.
std::string undatedAntennas(std::uint64_t seconds, char count) {
  return littleEndian(21, 2) + littleEndian(0xB0C1, 2) + littleEndian(seconds * 800 << 16, 8) +
         std::string(7, '\0') + count + '\0';
}

// At 100, 101 and 105 seconds, so a tick at 102.
std::string threeUndatedRecords() {
  return undatedAntennas(100, 2) + undatedAntennas(101, 4) + undatedAntennas(105, 8);
}

TEST_F(DecodeGenerations, WhereTheDateIsUnknownJsonHasTheTimeThatHasPassed) {
  const Result result = decode(threeUndatedRecords(), {"--every"});
  EXPECT_EQ(result.status, 0) << result.error;
  ASSERT_EQ(linesOf(result.output), 2u) << result.output;
  EXPECT_THAT(result.output, StartsWith("{\"Time\":null,\"Elapsed\":2.000,\"Display\":{"));
  EXPECT_THAT(result.output.substr(result.output.find('\n') + 1),
              StartsWith("{\"Time\":null,\"Elapsed\":5.000,\"Display\":{"));
}

TEST_F(DecodeGenerations, ElapsedIsAPathOfCsvWithAndWithoutADate) {
  const std::vector<std::string> table{"--csv", "Elapsed", "Serving Cell Info/Num Tx Antennas", "--"};
  const std::string header = "Time,Elapsed,Serving Cell Info/Num Tx Antennas\n";
  const Result undated = decode(threeUndatedRecords(), table);
  EXPECT_EQ(undated.output, header + ",2.000,4\n,5.000,8\n");
  EXPECT_EQ(undated.error, "");
  EXPECT_EQ(decode(threeRecords(), table).output,
            header + "2024-03-01T14:05:11.500Z,2.000,4\n2024-03-01T14:05:14.000Z,4.500,8\n");
}

TEST_F(DecodeGenerations, ATableWithoutTimesSaysHowToGetThoseThatHavePassed) {
  const Result result = decode(threeUndatedRecords(), {"--csv", "Serving Cell Info/Num Tx Antennas", "--"});
  EXPECT_EQ(result.output, "Time,Serving Cell Info/Num Tx Antennas\n,4\n,8\n");
  EXPECT_EQ(result.error, "varnel-decode: the modem of " + folder.file("capture") +
                              " knew no date, so rows have no time; the path Elapsed gives the seconds since "
                              "the first record\n");
}

TEST_F(DecodeGenerations, APictureOfUndatedRecordsCountsSeconds) {
  const std::string picture = folder.file("picture.svg");
  const Result result = decode(threeUndatedRecords(), {"--format", "none", "--plot", picture,
                                                       "Serving Cell Info/Num Tx Antennas", "--"});
  EXPECT_EQ(result.status, 0) << result.error;
  const std::string svg = contentsOf(picture);
  EXPECT_THAT(svg, HasSubstr("seconds since the first record"));
  EXPECT_THAT(svg, testing::Not(HasSubstr("1980")));
}

// Ten rounds of a hundred records in 9.9 s. Each round is dated an hour before the last one.
std::string setBackAgainAndAgain() {
  std::string capture = pcapHeader();
  for (std::uint32_t round = 0; round < 10; ++round) {
    for (std::uint32_t i = 0; i < 100; ++i)
      capture += pcapRecord(afternoon - 3600 * round + i / 10, i % 10 * 100'000'000, antennas(2));
  }
  return capture;
}

TEST_F(DecodeGenerations, AClockThatGoesBackAnHourEvery100RecordsLosesNoDisplayAndIsToldOnce) {
  const std::string capture = setBackAgainAndAgain();
  const char* const told =
      " jumps 9 times, first from 2024-03-01T14:05:18.900Z to 2024-03-01T13:05:09.000Z; displays are due "
      "every 2 s from there on\n";
  for (const auto& options : {std::vector<std::string>{"--log-level", "-1", "--every"},
                              {"--log-level", "-1", "--csv", "Serving Cell Info/Num Tx Antennas", "--"}}) {
    const Result result = decode(capture, options);
    EXPECT_EQ(result.status, 0) << result.error;
    // Each round has four displays at the regular times, and one at its end.
    EXPECT_EQ(linesOf(result.output), options.back() == "--every" ? 50u : 51u);
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
    EXPECT_THAT(result.error, HasSubstr(told));
  }
}

TEST_F(DecodeGenerations, DecadesWithoutRecordsAreOneStep) {
  const Result result =
      decode(pcapHeader() + pcapRecord(0, 0, antennas(2)) + pcapRecord(2'147'483'647, 0, antennas(4)),
             {"--csv", "Serving Cell Info/Num Tx Antennas", "--"});
  EXPECT_EQ(result.output,
            "Time,Serving Cell Info/Num Tx Antennas\n"
            "1970-01-01T00:00:02.000Z,2\n"
            "2038-01-19T03:14:07.000Z,4\n");
  EXPECT_THAT(result.error, HasSubstr(" jumps once, first from 1970-01-01T00:00:00.000Z to "
                                      "2038-01-19T03:14:07.000Z;"));
}

TEST_F(DecodeGenerations, CsvQuotesWhatTheCaptureHolds) {
  const Result result = decode(
      pcapHeader() + pcapRecord(afternoon, 0, pdpContexts("<array><string>a,\"b\"\n</string></array>")),
      {"--csv", "PDP Context Info/0"});
  EXPECT_EQ(result.output, "Time,PDP Context Info/0\n2024-03-01T14:05:09.000Z,\"a,\"\"b\"\"\n\"\n");
}

TEST_F(DecodeGenerations, WhatWasWrittenBeforeTheProgramAbortsIsThere) {
  const Result result =
      decode(threeRecords() + pcapRecord(afternoon + 5, 0, packet(0xFF, 0, "?")), {"--csv", "SIM Info"});
  EXPECT_EQ(result.status, -SIGABRT);
  EXPECT_EQ(result.output, "Time,SIM Info\n2024-03-01T14:05:11.500Z,\n");
}

TEST_F(DecodeGenerations, AnOutputThatCannotBeWrittenIsOneLineAndStatusOne) {
  const std::string path = write("capture", threeRecords());
  for (const char* options : {"--every ", "--csv 'SIM Info' -- ", "--stats "}) {
    const Result result = runInShell("--log-level -1 " + (options + path) + " >/dev/full");
    EXPECT_EQ(result.status, 1) << options;
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
    EXPECT_THAT(result.error, HasSubstr("standard output"));
  }
}

TEST_F(DecodeGenerations, WhenTheReaderLeavesTheRestIsNotReadAndNothingIsSaidOfIt) {
  constexpr std::uint32_t displays = 10'000;  // whose lines are more than a pipe holds
  std::string capture = pcapHeader();
  for (std::uint32_t i = 0; i < displays; ++i) capture += pcapRecord(afternoon + 2 * i, 0, antennas(2));
  const std::string path = write("capture", capture + "damaged");
  const Result result = runInShell("--log-level -1 --csv A/B -- " + path + " | head -n 1");
  EXPECT_EQ(result.output, "Time,A/B\n");
  EXPECT_EQ(result.error, "");
}

TEST_F(DecodeGenerations, WhenTheReaderLeavesTheFilesAreWrittenWhole) {
  constexpr std::uint32_t displays = 10'000;
  std::string capture = pcapHeader();
  for (std::uint32_t i = 0; i < displays; ++i)
    capture += pcapRecord(afternoon + 2 * i, 0, antennas(i % 2 == 0 ? 2 : 4));
  const std::string path = write("capture", capture);
  const std::string whole = folder.file("whole.dlf"), cut = folder.file("cut.dlf");
  const std::string options = "--log-level -1 --csv A/B 'Serving Cell Info/Tx Antennas' --dlf ";
  ASSERT_EQ(runInShell(options + whole + " -- " + path + " > /dev/null").status, 0);
  const Result result = runInShell(options + cut + " -- " + path + " | head -n 1");
  EXPECT_EQ(result.output, "Time,A/B,Serving Cell Info/Tx Antennas\n");
  EXPECT_EQ(contentsOf(cut), contentsOf(whole));
}

TEST_F(DecodeGenerations, StatisticsCountEveryMessageOnce) {
  std::string capture = pcapHeader();
  for (const std::string& message :
       {antennas(2), antennas(4), antennas(8).substr(0, 21), packet(1, 0xB0C0, ""), packet(2, 0xB0C1, "?"),
        std::string(), std::string(12, '\x01'), pdpContexts("<array/>"),
        packet(1, 0xB17F, std::string(19, '\0'))})
    capture += pcapRecord(afternoon, 0, message);
  const Result table = decode(capture, {"--stats"});
  EXPECT_EQ(table.status, 0) << table.error;
  EXPECT_EQ(
      table.output,
      "Log code        Received      Decoded    Too short     Too long      Unknown  Unknown version\n"
      "0xB0C0                 1            0            0            0            1                0\n"
      "0xB0C1                 3            2            1            0            0                0\n"
      "0xB17F                 1            0            1            0            0                0\n"
      "0xFF0002               1            1            0            0            0                0\n"
      "no header              2            0            2            0            0                0\n"
      "no log type            1            0            0            0            1                0\n"
      "Total                  9            3            4            0            2                0\n");
  const Result json = decode(capture, {"--stats", "--format", "json"});
  EXPECT_EQ(linesOf(json.output), 1u) << json.output;
  EXPECT_THAT(
      json.output,
      HasSubstr(
          R"("Total":{"Received":9,"Decoded":3,"Too Short":4,"Too Long":0,"Unknown":2,"Unknown Version":0}})"));
}

TEST_F(DecodeGenerations, StatisticsOfATruncatedCaptureCountWhatCameBefore) {
  const std::string capture = threeRecords();
  const Result result = decode(capture.substr(0, capture.size() - 1), {"--stats", "--log-level", "-1"});
  EXPECT_EQ(result.status, 1);
  EXPECT_THAT(result.output, HasSubstr("\nTotal                  2            2 "));
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
}

TEST_F(DecodeGenerations, APlotIsAPictureWithLegendUnitAndTime) {
  const std::string plot = folder.file("plot.svg");
  const std::string path = write("capture", threeRecords());
  const Result result = run({"--technology", "kalvi-lte", "--log-level", "-1", "--format", "none", path,
                             "--plot", plot, "Serving Cell Info/Num Tx Antennas"});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_THAT(result.output, IsEmpty());
  EXPECT_THAT(result.error, IsEmpty());
  struct stat file {};
  ASSERT_EQ(::stat(plot.c_str(), &file), 0);
  EXPECT_EQ(file.st_mode & 0777, 0600u);
  const std::string svg = contentsOf(plot);
  EXPECT_THAT(svg, StartsWith("<?xml"));
  EXPECT_THAT(svg, HasSubstr("viewBox=\"0 0 1200 600\""));
  EXPECT_THAT(svg, HasSubstr("Serving Cell Info/Num Tx Antennas</text>"));
  EXPECT_THAT(svg, HasSubstr("UTC, 2024-03-01</text>"));
  EXPECT_THAT(svg, HasSubstr(">14:05:11.500</text>"));
  EXPECT_THAT(svg, HasSubstr(">14:05:14.000</text>"));
  EXPECT_THAT(svg, HasSubstr(">4.0</text>")) << "the lowest value";
  EXPECT_THAT(svg, HasSubstr(">8.0</text>")) << "the highest value";
  EXPECT_THAT(svg, HasSubstr("<polyline"));
}

// A failure message should not contain the whole picture.
bool holds(const std::string& svg, const std::string& text) { return svg.find(text) != std::string::npos; }

TEST_F(DecodeGenerations, EveryLineOfAPlotStandsInTheLegendAndEachAxisHasItsUnit) {
  std::string rows;
  std::vector<std::string> arguments = {
      "--technology",         "kalvi-lte", "--format", "none", write("capture", ""), "--plot",
      folder.file("plot.svg")};
  for (int i = 0; i < 40; ++i) {
    const std::string name = "A number of no small importance " + std::to_string(i);
    rows += "<key>" + name + "</key><string>" + std::to_string(i) + (i % 2 == 0 ? " dBm" : "") + "</string>";
    arguments.push_back("PDP Context Info[Context=5]/" + name);
  }
  write("capture", pcapHeader() + pcapRecord(afternoon, 0,
                                             pdpContexts("<array><dict><key>Context</key><string>5</string>" +
                                                         rows + "</dict></array>")));
  const Result result = run(arguments);
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(result.error, "");
  const std::string svg = contentsOf(folder.file("plot.svg"));
  for (int i = 0; i < 40; ++i)
    EXPECT_TRUE(holds(svg, ">A number of no small importance " + std::to_string(i) +
                               (i % 2 == 0 ? " (dBm)</text>" : "</text>")))
        << i;
  for (const char* text : {"PDP Context Info[Context=5]</text>", ">dBm</text>", ">(no unit)</text>"})
    EXPECT_TRUE(holds(svg, text)) << text;
  EXPECT_FALSE(holds(svg, "viewBox=\"0 0 1200 600\"")) << "a long legend makes the picture higher";
}

TEST_F(DecodeGenerations, TheTimeAxisHasRoundTicks) {
  struct Length {
    std::uint32_t seconds;
    std::vector<std::string> labels;
  };
  const Length lengths[] = {
      {30, {"14:05:15", "14:05:20", "14:05:35"}},
      {600, {"14:06", "14:08", "14:14"}},
      {5 * 3600, {"15:00", "16:00", "19:00"}},
      {20 * 3600, {"03-01 18:00", "03-02 00:00", "03-02 06:00"}},
      {9 * 86400, {"2024-03-02", "2024-03-04", "2024-03-10"}},
  };
  for (const auto& [seconds, labels] : lengths) {
    const std::string path = write("capture", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) +
                                                  pcapRecord(afternoon + 2, 0, antennas(4)) +
                                                  pcapRecord(afternoon + seconds, 0, antennas(2)));
    const Result result = run({"--technology", "kalvi-lte", "--format", "none", path, "--plot",
                               folder.file("plot.svg"), "Serving Cell Info/Num Tx Antennas"});
    EXPECT_EQ(result.status, 0) << result.error;
    const std::string svg = contentsOf(folder.file("plot.svg"));
    for (const std::string& label : labels) EXPECT_TRUE(holds(svg, ">" + label + "</text>")) << label;
  }
}

TEST_F(DecodeGenerations, ThePictureOfALongPathAndAStrangeNameIsXml) {
  const std::string name(100'000, 'x');
  const std::string rows = "<key>" + name + "</key><string>1</string><key>b&amp;\x7F</key><string>2</string>";
  const std::string path =
      write("a<&>\x1B\xEF\xBF\xBF.pcap",
            pcapHeader() + pcapRecord(afternoon, 0, pdpContexts("<array><dict>" + rows + "</dict></array>")));
  const Result result =
      run({"--technology", "kalvi-lte", "--format", "none", path, "--plot", folder.file("plot.svg"),
           "PDP Context Info/0/" + name, "PDP Context Info/0/b&\x7F"});
  ASSERT_EQ(result.status, 0);
  const std::string svg = contentsOf(folder.file("plot.svg"));
  EXPECT_LT(svg.size(), 1u << 20);
  for (const char* strange : {"\x1B", "\x7F", "\xEF\xBF\xBF", "<&>", "&\\u"})
    EXPECT_FALSE(holds(svg, strange)) << strange;
  for (const char* text :
       {"a&lt;&amp;&gt;\\u001B\xEF\xBF\xBD.pcap: PDP Context Info/0", ">b&amp;\\u007F</text>"})
    EXPECT_TRUE(holds(svg, text)) << text;
}

TEST_F(DecodeGenerations, APathToPlotThatHasNoNumbersIsTold) {
  const std::string path =
      write("capture", pcapHeader() + pcapRecord(afternoon, 0,
                                                 pdpContexts("<array><string>Idle</string>"
                                                             "<string>7</string></array>")));
  const Result result = run({"--technology", "kalvi-lte", "--format", "none", path, "--plot",
                             folder.file("plot.svg"), "PDP Context Info/0", "PDP Context Info/1"});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error, "varnel-decode: no value of " + path +
                              " under 'PDP Context Info/0' begins with a number (one is 'Idle'), so no line "
                              "shows it\n");
  EXPECT_THAT(contentsOf(folder.file("plot.svg")), HasSubstr("</svg>"));
}

TEST_F(DecodeGenerations, APlotIsMadeBesideWhateverGoesToStandardOutput) {
  const std::string plot = folder.file("plot.svg");
  const std::string path = write("capture", threeRecords());
  const Result result = run({"--technology", "kalvi-lte", path, "--csv", "Serving Cell Info/Num Tx Antennas",
                             "--plot", plot, "Serving Cell Info/Num Tx Antennas"});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(linesOf(result.output), 3u) << result.output;
  EXPECT_THAT(contentsOf(plot), HasSubstr("</svg>"));
}

TEST_F(DecodeGenerations, APlotWithoutAnyNumberIsAnErrorAndNoFile) {
  const std::string plot = folder.file("plot.svg");
  const std::string path = write("capture", threeRecords());
  const Result result = run({"--technology", "kalvi-lte", "--log-level", "-1", "--format", "none", path,
                             "--plot", plot, "Serving Cell/Mistyped"});
  EXPECT_EQ(result.status, 1);
  EXPECT_THAT(result.error, HasSubstr("no number under the paths"));
  EXPECT_THAT(result.error, HasSubstr(path));
  EXPECT_FALSE(std::filesystem::exists(plot));
}

TEST_F(DecodeGenerations, APlotThatCannotBeWrittenIsOneLineAndStatusOne) {
  const std::string plot = folder.file("missing/plot.svg");
  const std::string path = write("capture", threeRecords());
  const Result result = run({"--technology", "kalvi-lte", "--log-level", "-1", "--format", "none", path,
                             "--plot", plot, "Serving Cell Info/Num Tx Antennas"});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_THAT(result.error, HasSubstr(plot));
}

}  // namespace
}  // namespace varnel
