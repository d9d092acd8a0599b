#include <gmock/gmock.h>
#include <sys/stat.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

#include "tests/varnel-decode/DecodeProgram.h"

// Runs the whole program on recordings that have positions.

namespace varnel {
namespace {

using testing::HasSubstr;
using testing::Not;

std::string entry(const char* key, const std::string& value) {
  return std::string("<key>") + key + "</key>" + value;
}
std::string real(const char* number) { return std::string("<real>") + number + "</real>"; }
std::string position(const char* latitude, const char* longitude, const std::string& more = {}) {
  return entry("Position", "<dict>" + entry("Latitude", real(latitude)) +
                               entry("Longitude", real(longitude)) + more + "</dict>");
}
std::string lteCell(const char* rsrp) {
  return entry("Cells", "<array><dict>" + entry("RadioAccessTechnology", "<string>LTE</string>") +
                            entry("CellType", "<string>Serving</string>") +
                            entry("EARFCN", "<integer>5230</integer>") + entry("RSRP", real(rsrp)) +
                            "</dict></array>");
}
// A modem report.
std::string report(const std::string& entries) {
  return packet(0xFF, 3, list("<dict>" + entry("Version", "<integer>1</integer>") + entries + "</dict>"));
}
std::string ofCard(char number, const std::string& message) { return std::string{'\x81', number} + message; }

class GpxProgram : public DecodeProgram {
 protected:
  // The status, and what the program has said.
  Result track(const std::string& records, std::vector<std::string> options = {"--format", "none"}) const {
    const std::string capture = write("walk", pcapHeader() + records);
    options.insert(options.end(), {"--gpx", gpx, capture});
    return run(options);
  }
  std::string written() const {
    std::ifstream file(gpx, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
  }

  const std::string gpx = folder.file("walk.gpx");
};

TEST_F(GpxProgram, APointHasItsPlaceItsTimeAndTheLevelsThere) {
  const Result result = track(pcapRecord(
      afternoon, 250000000,
      report(position("52.52", "-13.405",
                      entry("Altitude", real("34.26")) + entry("Time", "<date>2024-03-01T14:05:08Z</date>") +
                          entry("Source", "<string>GNSS &lt;1&gt;</string>")) +
             lteCell("-97.25"))));
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(result.error, "");
  EXPECT_EQ(written(),
            "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
            "<gpx version=\"1.1\" creator=\"varnel-decode\" xmlns=\"http://www.topografix.com/GPX/1/1\" "
            "xmlns:varnel=\"urn:varnel:track:1\">\n"
            "  <trk>\n"
            "    <name>" +
                folder.file("walk") +
                "</name>\n"
                "    <trkseg>\n"
                "      <trkpt lat=\"52.5200000\" lon=\"-13.4050000\">\n"
                "        <ele>34.3</ele>\n"
                "        <time>2024-03-01T14:05:08.000Z</time>\n"
                "        <desc>LTE EARFCN 5230, RSRP -97.25 dBm</desc>\n"
                "        <src>GNSS &lt;1&gt;</src>\n"
                "        <extensions>\n"
                "          <varnel:value path=\"Modem/LTE Cell/EARFCN\">5230</varnel:value>\n"
                "          <varnel:value path=\"Modem/LTE Cell/RSRP\" unit=\"dBm\">-97.25</varnel:value>\n"
                "        </extensions>\n"
                "      </trkpt>\n"
                "    </trkseg>\n"
                "  </trk>\n"
                "</gpx>\n");
}

TEST_F(GpxProgram, AFixWithoutATimeHasThatOfItsRecord) {
  track(pcapRecord(afternoon, 250000000, report(position("1", "2"))));
  EXPECT_THAT(written(), HasSubstr("        <time>2024-03-01T14:05:09.250Z</time>\n"));
}

TEST_F(GpxProgram, OneFixIsOnePoint) {
  const std::string fix = position("1", "2", entry("Time", "<date>2024-03-01T14:05:08Z</date>"));
  const std::string next = position("1", "2", entry("Time", "<date>2024-03-01T14:05:10Z</date>"));
  track(pcapRecord(afternoon, 0, report(fix + lteCell("-90"))) +
        pcapRecord(afternoon + 1, 0, report(fix + lteCell("-91"))) +
        pcapRecord(afternoon + 2, 0, report(next + lteCell("-92"))));
  EXPECT_THAT(written(), HasSubstr("RSRP -90.00 dBm"));
  EXPECT_THAT(written(), Not(HasSubstr("RSRP -91.00 dBm")));
  EXPECT_THAT(written(), HasSubstr("RSRP -92.00 dBm"));
}

TEST_F(GpxProgram, AReportWithoutAPositionInterruptsTheTrack) {
  track(pcapRecord(afternoon, 0, report(position("1", "2"))) + pcapRecord(afternoon + 1, 0, report("")) +
        pcapRecord(afternoon + 2, 0, report("")) + pcapRecord(afternoon + 3, 0, report(position("3", "4"))));
  EXPECT_THAT(written(),
              HasSubstr("      </trkpt>\n    </trkseg>\n    <trkseg>\n      <trkpt lat=\"3.0000000\""));
}

TEST_F(GpxProgram, EachCardHasATrackOfItsOwnWithItsOwnLevels) {
  track(pcapRecord(afternoon, 0, ofCard(2, report(position("3", "4") + lteCell("-92")))) +
        pcapRecord(afternoon, 0, ofCard(1, report(position("1", "2") + lteCell("-91")))));
  const std::string text = written();
  EXPECT_THAT(text,
              HasSubstr(", SIM 1</name>\n    <trkseg>\n      <trkpt lat=\"1.0000000\" lon=\"2.0000000\">\n"
                        "        <time>2024-03-01T14:05:09.000Z</time>\n"
                        "        <desc>LTE EARFCN 5230, RSRP -91.00 dBm</desc>"));
  EXPECT_THAT(text,
              HasSubstr(", SIM 2</name>\n    <trkseg>\n      <trkpt lat=\"3.0000000\" lon=\"4.0000000\">\n"
                        "        <time>2024-03-01T14:05:09.000Z</time>\n"
                        "        <desc>LTE EARFCN 5230, RSRP -92.00 dBm</desc>"));
}

TEST_F(GpxProgram, LevelsOfTheModemsOwnPacketsCountForTenSeconds) {
  const std::string measured = packet(1, 0x5137, std::string(16, '\0'));
  track(pcapRecord(afternoon, 0, measured) + pcapRecord(afternoon + 10, 0, report(position("1", "2"))) +
        pcapRecord(afternoon + 11, 0, report(position("3", "4"))));
  const std::string text = written();
  const std::size_t second = text.find("<trkpt lat=\"3");
  ASSERT_NE(second, std::string::npos) << text;
  EXPECT_THAT(text.substr(0, second), HasSubstr("path=\"GSM/GSM Serving Cell/RSSI\""));
  EXPECT_THAT(text.substr(second), Not(HasSubstr("GSM Serving Cell")));
}

TEST_F(GpxProgram, WithoutPositionsThereIsALineAndNoFile) {
  const Result result = track(pcapRecord(afternoon, 0, report(lteCell("-90"))));
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.error, "varnel-decode: " + folder.file("walk") + " has no positions, so " + gpx +
                              " was not written; a server keeps them in recordings with --record-position\n");
  EXPECT_FALSE(std::filesystem::exists(gpx));
}

TEST_F(GpxProgram, AReportOfAnotherVersionHasNoPosition) {
  const std::string later = packet(
      0xFF, 3, list("<dict>" + entry("Version", "<integer>2</integer>") + position("1", "2") + "</dict>"));
  EXPECT_EQ(track(pcapRecord(afternoon, 0, later)).status, 1);
  EXPECT_FALSE(std::filesystem::exists(gpx));
}

TEST_F(GpxProgram, TheFileIsForItsOwnerAlone) {
  track(pcapRecord(afternoon, 0, report(position("1", "2"))));
  struct stat status {};
  ASSERT_EQ(::stat(gpx.c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 07777, 0600u);
}

TEST_F(GpxProgram, TheDisplayHidesThePositionThatTheTrackShows) {
  const std::string records = pcapRecord(afternoon, 0, report(position("52.25", "2")));
  EXPECT_THAT(track(records, {"--format", "paths"}).output,
              HasSubstr("\n/Modem/Position/Latitude\tpresent\n"));
  EXPECT_THAT(track(records, {"--format", "paths", "--identities"}).output,
              HasSubstr("\n/Modem/Position/Latitude\t52.250000 °\n"));
  EXPECT_THAT(track(records, {"--stats"}).output, Not(HasSubstr("52.25")));
}

TEST_F(GpxProgram, MistakesAreUsageErrors) {
  const std::string capture =
      write("walk", pcapHeader() + pcapRecord(afternoon, 0, report(position("1", "2"))));
  EXPECT_EQ(run({"--technology", "kalvi-lte", "--gpx", gpx, capture}).status, 2);
  EXPECT_EQ(run({"--gpx", "", capture}).status, 2);
  EXPECT_EQ(run({"--gpx", gpx, capture, capture}).status, 2);
  EXPECT_EQ(run({"--gpx", capture, capture}).status, 2) << "it would overwrite the capture";
  EXPECT_EQ(run({"--follow", "--every", "--gpx", gpx, capture}).status, 2);
  EXPECT_FALSE(std::filesystem::exists(gpx));
}

TEST_F(GpxProgram, AFileThatCannotBeWrittenIsOneLine) {
  const std::string capture =
      write("walk", pcapHeader() + pcapRecord(afternoon, 0, report(position("1", "2"))));
  const Result result = run({"--format", "none", "--gpx", folder.file("no/folder.gpx"), capture});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_THAT(result.error, HasSubstr("cannot write " + folder.file("no/folder.gpx")));
}

}  // namespace
}  // namespace varnel
