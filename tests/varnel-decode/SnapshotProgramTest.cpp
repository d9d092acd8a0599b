#include <gmock/gmock.h>
#include <sys/stat.h>

#include "tests/varnel-decode/DecodeProgram.h"

// Runs the whole program on snapshots that this file or the program itself writes.

namespace varnel {
namespace {

using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::StartsWith;

std::string displayItem(const std::string& date, const std::string& level) {
  return "<dict><key>DisplayState</key><data>AQI=</data><key>Display</key><dict><key>Cell</"
         "key><dict><key>Level"
         "</key><string>" +
         level + "</string></dict></dict><key>ExtraInfo</key><dict/><key>Date</key><string>" + date +
         "</string><key>Description</key><string>Snapshot (" + date + ")</string></dict>";
}

std::string snapshot(const std::string& items) {
  return "<?xml version=\"1.0\"?>" +
         list("<dict><key>Timestamp</key><string>2024-03-01 14:05:14 +0000</string><key>Data</key><array>" +
              items + "</array><key>Description</key><string>at the lake</string></dict>");
}

std::string twoDisplays() {
  return displayItem("2024-03-01 14:05:11 +0000", "-85 dBm") +
         displayItem("2024-03-01 14:05:13 +0000", "-86 dBm");
}
const std::string binaryLog =
    "<dict><key>Description</key><string>DLF binary (3 bytes)</string><key>DLF</key>"
    "<data>AAEC</data></dict>";

class DecodeSnapshot : public DecodeProgram {
 protected:
  Result show(const std::string& contents, std::vector<std::string> options = {}) const {
    options.push_back(write("snapshot.varnel", contents));
    return run(options);
  }
};

TEST_F(DecodeSnapshot, UnitsAreThoseThatNoTechnologyContradictsOrThatOfTheOneNamed) {
  std::string items = displayItem("2024-03-01 14:05:11 +0000", "-85.25 dBm");
  items.replace(items.find("<key>Cell</"), 11, "<key>Serving Cell Measurements</");
  items.replace(items.find("Level"), 5, "Average RSRP");
  const std::string path = "Serving Cell Measurements/Average RSRP";
  const std::string expected = "Time," + path + " [dBm]\n2024-03-01T14:05:11.000Z,-85.25\n";
  EXPECT_EQ(show(snapshot(items), {"--numbers", "--csv", path, "--"}).output, expected);
  EXPECT_EQ(show(snapshot(items), {"--technology", "kalvi-lte", "--numbers", "--csv", path, "--"}).output,
            expected);
  EXPECT_EQ(show(snapshot(items), {"--technology", "ifx-gsm", "--numbers", "--csv", path, "--"}).output,
            "Time," + path + "\n2024-03-01T14:05:11.000Z,-85.25 dBm\n")
      << "whose displays have no such entry";
}

TEST_F(DecodeSnapshot, ShowsTheStoredDisplaysWithoutRawBytes) {
  const Result result = show(snapshot(twoDisplays() + binaryLog));
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(result.output,
            "Timestamp    2024-03-01 14:05:14 +0000\n"
            "Data\n"
            "  0\n"
            "    Date         2024-03-01 14:05:11 +0000\n"
            "    Description  Snapshot (2024-03-01 14:05:11 +0000)\n"
            "    Display\n"
            "      Cell\n"
            "        Level  -85 dBm\n"
            "    ExtraInfo\n"
            "  1\n"
            "    Date         2024-03-01 14:05:13 +0000\n"
            "    Description  Snapshot (2024-03-01 14:05:13 +0000)\n"
            "    Display\n"
            "      Cell\n"
            "        Level  -86 dBm\n"
            "    ExtraInfo\n"
            "  2\n"
            "    Description  DLF binary (3 bytes)\n"
            "Description  at the lake\n");
  EXPECT_EQ(result.error, "");
}

TEST_F(DecodeSnapshot, IsShownInEveryFormat) {
  const std::string contents = snapshot(twoDisplays() + binaryLog);
  EXPECT_THAT(show(contents, {"--format", "paths"}).output,
              HasSubstr("\n/Data/1/Display/Cell/Level\t-86 dBm\n"));
  EXPECT_THAT(show(contents, {"--format", "json"}).output,
              HasSubstr(R"json("Description":"DLF binary (3 bytes)"}],"Description":"at the lake"})json"));
  const Value plist = readList(show(contents, {"--format", "plist"}).output);
  ASSERT_TRUE(plist.dictionary() && plist.dictionary()->get("Data").array());
  EXPECT_EQ(plist.dictionary()->get("Data").array()->size(), 3u);
}

TEST_F(DecodeSnapshot, EachDisplayIsAGeneration) {
  const std::string contents = snapshot(twoDisplays() + binaryLog);
  EXPECT_EQ(show(contents, {"--every"}).output,
            R"({"Time":"2024-03-01T14:05:11.000Z","Display":{"Cell":{"Level":"-85 dBm"}}})"
            "\n"
            R"({"Time":"2024-03-01T14:05:13.000Z","Display":{"Cell":{"Level":"-86 dBm"}}})"
            "\n");
  EXPECT_EQ(show(contents, {"--csv", "Cell/Level"}).output,
            "Time,Cell/Level\n2024-03-01T14:05:11.000Z,-85 dBm\n2024-03-01T14:05:13.000Z,-86 dBm\n");
}

TEST_F(DecodeSnapshot, ADisplayWithoutADateIsOfTheTimeOfTheSnapshot) {
  const std::string display = "<dict><key>Display</key><string>x</string></dict>";
  EXPECT_EQ(show(snapshot(display), {"--every"}).output,
            "{\"Time\":\"2024-03-01T14:05:14.000Z\",\"Display\":\"x\"}\n");
  const Result result = show(list("<dict><key>Data</key><array>" + display + "</array></dict>"), {"--every"});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_THAT(result.error, HasSubstr("snapshot.varnel"));
}

TEST_F(DecodeSnapshot, StandardInputAndBinaryListsAreReadToo) {
  const std::string path = write("snapshot", snapshot(twoDisplays()));
  EXPECT_EQ(runInShell("--every - <" + path).output, run({"--every", path}).output);
  const auto binary = writeBinaryPropertyList(readList(snapshot(twoDisplays())));
  ASSERT_TRUE(binary);
  EXPECT_EQ(show({binary->begin(), binary->end()}, {"--every"}).output, run({"--every", path}).output);
}

TEST_F(DecodeSnapshot, TheBinaryLogIsTakenOut) {
  const std::string path = folder.file("log.dlf");
  const Result result = show(snapshot(twoDisplays() + binaryLog), {"--format", "none", "--dlf", path});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(contentsOf(path), std::string("\x00\x01\x02", 3));
  struct stat file {};
  ASSERT_EQ(::stat(path.c_str(), &file), 0);
  EXPECT_EQ(file.st_mode & 0777, 0600u);
}

TEST_F(DecodeSnapshot, TheBinaryLogOfACaptureIsThatOfItsSnapshot) {
  const std::string saved = folder.file("saved.varnel"), direct = folder.file("direct.dlf"),
                    extracted = folder.file("extracted.dlf");
  const Result result = decode(pcapHeader() + pcapRecord(afternoon, 0, antennas(2)),
                               {"--format", "none", "--snapshot", saved, "--dlf", direct});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(run({"--dlf", extracted, saved}).status, 0);
  // The 161 bytes of the version report, and the 22 bytes of the packet without the first.
  const std::string log = contentsOf(direct);
  EXPECT_EQ(log.size(), 182u);
  EXPECT_EQ(log.substr(0, 4), std::string("\xA1\x00\xFD\x1F", 4));
  EXPECT_EQ(log.substr(161), antennas(2).substr(1));
  EXPECT_EQ(contentsOf(extracted), log);
}

TEST_F(DecodeSnapshot, WithoutABinaryLogThereIsNoFileButAnError) {
  const std::string path = folder.file("log.dlf");
  const Result result = show(snapshot(twoDisplays()), {"--dlf", path});
  EXPECT_EQ(result.status, 1);
  EXPECT_THAT(result.output, StartsWith("Timestamp")) << "the displays are shown all the same";
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_THAT(result.error, HasSubstr("no binary log"));
  EXPECT_FALSE(std::filesystem::exists(path));
}

TEST_F(DecodeSnapshot, WhatIsNoSnapshotIsOneLineAndStatusOne) {
  for (const std::string& contents : {std::string("<html></html>"), std::string("bplist00"), list("<array/>"),
                                      list("<dict/>"), list("<dict><key>Data</key><dict/></dict>")}) {
    const Result result = show(contents);
    EXPECT_EQ(result.status, 1) << contents;
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
    EXPECT_THAT(result.error, HasSubstr("snapshot.varnel"));
  }
}

TEST_F(DecodeSnapshot, WhatNeedsMessagesIsAMistake) {
  for (const char* option : {"--stats", "--snapshot"}) {
    std::vector<std::string> options = {option};
    if (options[0] == "--snapshot") options.push_back(folder.file("copy"));
    const Result result = show(snapshot(twoDisplays()), options);
    EXPECT_EQ(result.status, 2) << option;
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
    EXPECT_THAT(result.error, HasSubstr("is a snapshot"));
  }
}

}  // namespace
}  // namespace varnel
