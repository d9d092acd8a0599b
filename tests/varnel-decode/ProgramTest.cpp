#include <gmock/gmock.h>
#include <sys/stat.h>

#include <csignal>
#include <filesystem>
#include <string>
#include <vector>

#include "tests/varnel-decode/DecodeProgram.h"

// Runs the whole program on captures that are written here byte by byte.

namespace varnel {

namespace {

using ::testing::HasSubstr;
using ::testing::MatchesRegex;
using ::testing::Not;
using ::testing::StartsWith;

TEST_F(DecodeProgram, PathsShowsEachNodeOnALine) {
  const Result result = decode(pcapHeader() + pcapRecord(afternoon, 0, antennas(2)), {"--format", "paths"});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_THAT(result.output, StartsWith("/\n"));
  EXPECT_THAT(result.output, HasSubstr("\n/Serving Cell Info\n"));
  EXPECT_THAT(result.output, HasSubstr("\n/Serving Cell Info/Num Tx Antennas\t2\n"));
  EXPECT_THAT(result.output, HasSubstr("\n/PDP Context Info\n"));
}

TEST_F(DecodeProgram, TextIsTheDefault) {
  const std::string capture = pcapHeader() + pcapRecord(afternoon, 0, antennas(2));
  const Result result = decode(capture);
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_THAT(result.output, HasSubstr("\n  Num Tx Antennas"));
  EXPECT_EQ(result.output, decode(capture, {"--format", "text"}).output);
}

TEST_F(DecodeProgram, JsonIsOneLineWithArraysAndUnknownLeaves) {
  const Result result = decode(pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) +
                                   pcapRecord(afternoon, 0,
                                              pdpContexts("<array><string>x</string><dict><key>A"
                                                          "</key><integer>1</integer></dict></array>")),
                               {"--format", "json"});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(linesOf(result.output), 1u) << result.output;
  EXPECT_THAT(result.output, HasSubstr(R"("Num Tx Antennas":"2")"));
  EXPECT_THAT(result.output, HasSubstr(R"json("PDP Context Info":["x",{"A":"(unknown)"}])json"));
}

TEST_F(DecodeProgram, OfObjectMessagesTheLastOneIsTheDisplay) {
  const std::string path = write(
      "capture", pcapHeader() + pcapRecord(afternoon, 0, list("<string>earlier</string>")) +
                     pcapRecord(afternoon, 0,
                                list("<dict><key>Cell</key><dict><key>RSSI</key><string>-71</string></dict>"
                                     "<key>List</key><array><true/><string>A</string></array></dict>")));
  const Result result = run({"--technology", "ifx-gsm", "--format", "json", path});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(result.output, "{\"Cell\":\"-71\",\"List\":[\"A\"]}\n");
}

TEST_F(DecodeProgram, PropertyListKeepsEveryKindOfValue) {
  const Result result = decode(
      pcapHeader() + pcapRecord(afternoon, 0, pdpContexts("<array><integer>7</integer><true/></array>")) +
          pcapRecord(afternoon, 0, simFiles("<dict><key>kSimFile_ICCID</key><data>AQI=</data></dict>")),
      {"--format", "plist"});
  EXPECT_EQ(result.status, 0) << result.error;
  const Value list = readList(result.output);
  const Dictionary* display = list.dictionary();
  ASSERT_TRUE(display) << result.output;
  const Array* contexts = display->get("PDP Context Info").array();
  ASSERT_TRUE(contexts) << result.output;
  ASSERT_EQ(contexts->size(), 2u);
  EXPECT_EQ((*contexts)[0].integer(), 7);
  EXPECT_EQ((*contexts)[1].boolean(), true);
  const Dictionary* sim = display->get("SIM Info").dictionary();
  ASSERT_TRUE(sim) << result.output;
  ASSERT_TRUE(sim->get("EF-ICCID").data()) << result.output;
  EXPECT_EQ(*sim->get("EF-ICCID").data(), (Bytes{1, 2}));
}

TEST_F(DecodeProgram, ACaptureWithoutRecordsHasNoDisplayAndIsStatusOne) {
  EXPECT_EQ(decode(pcapHeader(), {"--format", "paths"}).output, "/\t(unknown)\n");
  EXPECT_EQ(decode(pcapHeader(), {"--format", "json"}).output, "\"(unknown)\"\n");
  EXPECT_EQ(decode(pcapHeader(), {"--format", "text"}).output, "(unknown)\n");
  EXPECT_EQ(decode(pcapHeader(), {"--format", "plist"}).output, "");
  const Result result = decode(pcapHeader());
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.error,
            "varnel-decode: " + folder.file("capture") + " has no records, so there is nothing to show\n");
}

TEST_F(DecodeProgram, ACaptureOfAnotherTechnologyIsToldByItsLogCodes) {
  const std::string lte = pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) +
                          pcapRecord(afternoon, 0, pdpContexts("<array/>")) +
                          pcapRecord(afternoon, 0, antennas(4));
  const std::string path = write("walk.pcap", lte);
  for (const char* technology : {"kalvi-gsm-umts", "kalvi-utran-2", "kalvi-cdma"}) {
    const Result result = run({"--technology", technology, "--format", "none", path});
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.error, StartsWith(std::string("varnel-decode: ") + technology +
                                         " knows none of the 2 modem messages"));
    EXPECT_THAT(result.error,
                HasSubstr(path + " (log codes 0xB0C1); try --technology all-radios or kalvi-lte\n"));
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  }
  EXPECT_EQ(run({"--technology", "kalvi-lte", "--format", "none", path}).error, "");
}

TEST_F(DecodeProgram, ACaptureOfObjectsIsToldAsSuch) {
  const std::string path =
      write("walk.pcap", pcapHeader() + pcapRecord(afternoon, 0, list("<string>object</string>")));
  const Result result = run({"--technology", "kalvi-lte", "--format", "none", path});
  EXPECT_EQ(result.error, "varnel-decode: kalvi-lte knows none of the 1 modem messages of " + path +
                              "; try --technology ifx-gsm\n");
}

TEST_F(DecodeProgram, ACaptureThatNoTechnologyKnowsIsToldAndItsPathsAreNot) {
  const Result result =
      decode(pcapHeader() + pcapRecord(afternoon, 0, packet(1, 0xFFFE, "?")), {"--csv", "Serving Cell"});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_THAT(result.error, HasSubstr("(log codes 0xFFFE); nor does any other technology\n"));
}

// A serving cell of LTE on EARFCN 5230.
std::string servingCell(std::uint16_t physicalCell, std::uint8_t version = 3) {
  return packet(1, 0xB0C2,
                littleEndian(version, 1) + littleEndian(physicalCell, 2) + littleEndian(5230, 4) +
                    littleEndian(23230, 4) + std::string(18, '\0'));
}

TEST_F(DecodeProgram, ACaptureThatNamesNoTechnologyIsThatOfAllRadios) {
  const std::string path = write("drive.pcap", pcapHeader() + pcapRecord(afternoon, 0, servingCell(16)));
  const Result result = run({path, "--format", "paths"});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error, "");
  EXPECT_THAT(result.output, HasSubstr("\n/LTE/Serving Cell/Physical Cell ID\t16\n"));
  EXPECT_THAT(run({path, path, "--numbers", "--csv", "LTE/Serving Cell/Downlink Frequency"}).output,
              StartsWith("Capture,Time,"));
}

TEST_F(DecodeProgram, IdentitiesAreShownOnlyWhenTheyAreAskedFor) {
  // A registration with the GUTI of 001-01, whose M-TMSI is 0x12345678.
  const std::string registered = littleEndian(2, 1) + littleEndian(3, 1) + littleEndian(0, 2) +
                                 "\x11\xF1\x10" + '\x01' + '\0' + "\x11\xF1\x10" + littleEndian(0x8001, 2) +
                                 littleEndian(1, 1) + littleEndian(0x12345678, 4);
  const std::string path =
      write("drive.pcap", pcapHeader() + pcapRecord(afternoon, 0, packet(1, 0xB0EE, registered)));
  EXPECT_THAT(run({path, "--format", "paths"}).output, HasSubstr("\n/LTE/Registration/M-TMSI\tpresent\n"));
  EXPECT_THAT(run({path, "--format", "paths", "--identities"}).output,
              HasSubstr("\n/LTE/Registration/M-TMSI\t0x12345678\n"));
}

TEST_F(DecodeProgram, WhatAllRadiosDoNotKnowIsToldAsOfAnotherTechnology) {
  const std::string path =
      write("walk.pcap", pcapHeader() + pcapRecord(afternoon, 0, list("<string>an object</string>")));
  EXPECT_EQ(run({"--format", "none", path}).error,
            "varnel-decode: all-radios knows none of the 1 modem messages of " + path +
                "; try --technology ifx-gsm\n");
}

TEST_F(DecodeProgram, VersionsThatNobodyKnowsAreNamed) {
  const std::string path = write("drive.pcap", pcapHeader() + pcapRecord(afternoon, 0, servingCell(16)) +
                                                   pcapRecord(afternoon, 0, servingCell(17, 99)));
  EXPECT_EQ(
      run({path, "--stats"}).output,
      "Log code        Received      Decoded    Too short     Too long      Unknown  Unknown version\n"
      "0xB0C2                 2            1            0            0            0                1\n"
      "0xB0C2 v99                                                                                  1\n"
      "Total                  2            1            0            0            0                1\n");
}

TEST_F(DecodeProgram, AMissingTemplateEndsItWithALineThatNamesTheFile) {
  const std::string path = write("capture", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)));
  const std::string resources = folder.file("resources");
  std::filesystem::create_directory(resources);
  std::ofstream(resources + "/Other.plist") << list("<string>other</string>");
  for (const bool isDamaged : {false, true}) {
    if (isDamaged) std::ofstream(resources + "/LTE.plist") << "no list";
    Process process("/bin/sh",
                    {"-c", "VARNEL_RESOURCES=" + resources +
                               " exec " VARNEL_DECODE_PROGRAM " --technology kalvi-lte --every " + path});
    const Result result = finish(process);
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
    EXPECT_THAT(result.error, StartsWith("varnel-decode: the display template " + resources + "/LTE.plist"));
  }
}

TEST_F(DecodeProgram, AMissingResourceFolderIsToldAtTheStart) {
  const std::string path = write("capture", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)));
  const std::string missing = folder.file("missing");
  Process process("/bin/sh", {"-c", "VARNEL_RESOURCES=" + missing +
                                        " exec " VARNEL_DECODE_PROGRAM " --technology kalvi-lte " + path});
  const Result result = finish(process);
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_THAT(result.error, HasSubstr(missing));
}

TEST_F(DecodeProgram, NothingFromACaptureSteersATerminal) {
  // ESC, DEL, and the one-character CSI of C1.
  const std::string object = list("<dict><key>a\x7F</key><string>b\xC2\x9B\xC3\xA9</string></dict>");
  const std::string path = write("capture", pcapHeader() + pcapRecord(afternoon, 0, object));
  const auto outputAs = [&](std::vector<std::string> options) {
    options.insert(options.begin(), {"--technology", "ifx-gsm", path});
    return run(options).output;
  };
  EXPECT_EQ(outputAs({"--format", "paths"}), "/\n/a\\u007F\tb\\u009B\xC3\xA9\n");
  EXPECT_EQ(outputAs({"--format", "json"}), "{\"a\\u007F\":\"b\\u009B\xC3\xA9\"}\n");
  EXPECT_EQ(outputAs({"--format", "text"}), "a\\x7f  b\\x9b\xC3\xA9\n");
  EXPECT_THAT(outputAs({"--csv", "a\x7F"}), StartsWith("Time,a\\u007F\n"));
  EXPECT_THAT(outputAs({"--csv", "a\x7F"}), HasSubstr(",b\\u009B\xC3\xA9\n"));
}

TEST_F(DecodeProgram, HeadingsAndMessagesShowNamesOfFilesPrintable) {
  const std::string path = write("walk\n\x1B[2J.pcap", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)));
  const std::string shown = folder.file("walk\\u000A\\u001B[2J.pcap");
  EXPECT_THAT(run({"--technology", "kalvi-lte", path, path}).output, StartsWith("==> " + shown + " <==\n"));
  EXPECT_THAT(run({"--technology", "kalvi-lte", path + "x"}).error, HasSubstr(shown + "x"));
  EXPECT_THAT(run({"--technology", "kalvi-cdma", path}).error, HasSubstr(shown));
}

TEST_F(DecodeProgram, ADisplayThatNoPropertyListHoldsIsAnError) {
  // The binary list {"kSimFile_ICCID": U+0001}.
  const std::string sim = std::string("bplist00", 8) + "\xD1\x01\x02" + "\x5E" + "kSimFile_ICCID" +
                          "\x51\x01" + std::string("\x08\x0B\x1A", 3) + std::string(6, '\0') + "\x01\x01" +
                          std::string("\0\0\0\0\0\0\0\3\0\0\0\0\0\0\0\0\0\0\0\0\0\0\0\x1C", 24);
  const std::string capture = pcapHeader() + pcapRecord(afternoon, 0, packet(0xFF, 0, sim));
  EXPECT_THAT(decode(capture, {"--format", "json"}).output, HasSubstr(R"("EF-ICCID":"\u0001")"));
  const Result result = decode(capture, {"--format", "plist", "--log-level", "-1"});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
}

TEST_F(DecodeProgram, EveryTechnologyKeepsItsLinesOutOfTheData) {
  const std::string path = write("capture", pcapHeader());
  for (const char* technology : {"ifx-gsm", "kalvi-gsm-umts", "kalvi-lte", "kalvi-utran-2"}) {
    const Result result = run({"--technology", technology, "--format", "paths", path});
    EXPECT_EQ(result.output, "/\t(unknown)\n") << technology << ": " << result.error;
  }
}

TEST_F(DecodeProgram, ByDefaultNoLogLineContradictsTheCounts) {
  const Result result = decode(pcapHeader() + pcapRecord(afternoon, 0, antennas(2)), {"--stats"});
  EXPECT_THAT(result.output, HasSubstr("\n0xB0C1                 1            1 "));
  EXPECT_EQ(result.error, "");
}

TEST_F(DecodeProgram, LogLevelThreeAddsErrorLinesAndNoWarnings) {
  const Result result = decode(pcapHeader() + pcapRecord(afternoon, 0, antennas(2)), {"--log-level", "3"});
  EXPECT_THAT(result.error, StartsWith("<3>Creating LTELogGenerator object\n"));
  EXPECT_THAT(result.error, HasSubstr("\n<3>Received an unknown log message: 45249\n"));
  EXPECT_THAT(result.error, Not(HasSubstr("<4>")));
}

TEST_F(DecodeProgram, LogLevelFourAddsTraceAndLifeLines) {
  const Result result =
      decode(pcapHeader() + pcapRecord(afternoon, 0, antennas(2)), {"--log-level", "4", "--format", "paths"});
  EXPECT_THAT(result.error, HasSubstr("\n<4>Creating Log object: 0x"));
  EXPECT_THAT(result.error,
              HasSubstr("\n<4>LTE Serving Cell Info\n<3>Received an unknown log message: 45249\n"));
  EXPECT_THAT(result.error, HasSubstr("\n<4>LTELogGenerator is destructed 0x"));
  EXPECT_THAT(result.error, HasSubstr("\n<4>KLV_GSMLogGenerator is destructed 0x"));
}

TEST_F(DecodeProgram, LogLevelMinusOneSilencesTheLog) {
  const Result result = decode(pcapHeader() + pcapRecord(afternoon, 0, antennas(2)), {"--log-level", "-1"});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error, "");
}

TEST_F(DecodeProgram, ANewlineThatEndsALogTextIsNotDoubled) {
  const Result result =
      decode(pcapHeader() + pcapRecord(afternoon, 0, packet(0xFF, 1, "no list")), {"--log-level", "3"});
  EXPECT_THAT(result.error, HasSubstr("\n<3>Failed to get Cell Array\n"));
  EXPECT_THAT(result.error, Not(HasSubstr("\n\n")));
}

TEST_F(DecodeProgram, AnUnreadableSIMPayloadAbortsAfterItsLogLineWithoutADisplay) {
  const std::string snapshot = folder.file("snapshot");
  const Result result = decode(
      pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) + pcapRecord(afternoon, 0, packet(0xFF, 0, "?")),
      {"--snapshot", snapshot, "--log-level", "3"});
  EXPECT_EQ(result.status, -SIGABRT);
  EXPECT_EQ(result.output, "");
  EXPECT_THAT(result.error, HasSubstr("\n<3>SIM File dictionary data could not be constructed\n"));
  EXPECT_FALSE(std::filesystem::exists(snapshot));
}

TEST_F(DecodeProgram, AnObjectOfAnUnknownKindAbortsWithFileLineAndDescription) {
  const std::string path =
      write("capture", pcapHeader() + pcapRecord(afternoon, 0, list("<integer>1</integer>")));
  const Result result = run({"--technology", "ifx-gsm", path});
  EXPECT_EQ(result.status, -SIGABRT);
  EXPECT_EQ(result.output, "");
  EXPECT_THAT(result.error, HasSubstr("Unknown object of type integer encountered"));
  EXPECT_THAT(result.error, HasSubstr("LogGenerator/GSM/GSMLogGenerator:78: "));
}

TEST_F(DecodeProgram, AnObjectThatIsNoPropertyListAbortsWithFileLineAndDescription) {
  const std::string path = write("capture", pcapHeader() + pcapRecord(afternoon, 0, "?"));
  const Result result = run({"--technology", "ifx-gsm", path});
  EXPECT_EQ(result.status, -SIGABRT);
  EXPECT_EQ(result.output, "");
  EXPECT_THAT(result.error, HasSubstr("Could not deserialize the object"));
  EXPECT_THAT(result.error, HasSubstr("LogGenerator/GSM/GSMLogGenerator:90: "));
}

TEST_F(DecodeProgram, StandardInputIsReadForADash) {
  const std::string path = write("capture", pcapHeader() + pcapRecord(afternoon, 0, antennas(4)));
  const Result result = runInShell("--format paths - <" + path);
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_THAT(result.output, HasSubstr("\n/Serving Cell Info/Num Tx Antennas\t4\n"));
}

TEST_F(DecodeProgram, PcapngIsReadLikePcap) {
  const std::string section =
      pcapngBlock(0x0A0D0D0A, littleEndian(0x1A2B3C4D, 4) + littleEndian(1, 2) + littleEndian(0, 2) +
                                  littleEndian(0xFFFFFFFFFFFFFFFF, 8));
  const std::string interface =
      pcapngBlock(1, littleEndian(user0, 2) + littleEndian(0, 2) + littleEndian(0, 4));
  const std::string message = antennas(8);
  const std::string record = pcapngBlock(
      6, std::string(12, '\0') + littleEndian(message.size(), 4) + littleEndian(message.size(), 4) + message);
  const Result result = decode(section + interface + record, {"--format", "paths"});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_THAT(result.output, HasSubstr("\n/Serving Cell Info/Num Tx Antennas\t8\n"));
}

TEST_F(DecodeProgram, ATruncatedCaptureShowsWhatCameBeforeTheFault) {
  const std::string snapshot = folder.file("snapshot");
  const std::string second = pcapRecord(afternoon, 0, antennas(4));
  const Result result =
      decode(pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) + second.substr(0, second.size() - 1),
             {"--format", "paths", "--log-level", "-1", "--snapshot", snapshot});
  EXPECT_EQ(result.status, 1);
  EXPECT_THAT(result.output, HasSubstr("\n/Serving Cell Info/Num Tx Antennas\t2\n"));
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_THAT(result.error, HasSubstr(folder.file("capture")));
  EXPECT_TRUE(std::filesystem::exists(snapshot));
}

TEST_F(DecodeProgram, AFileThatIsNoCaptureForThisProgramIsOneLineAndStatusOne) {
  for (const std::string& contents :
       {std::string(), std::string("This is no capture, whatever its name says."), pcapHeader(ethernet),
        pcapHeader().substr(0, 20)}) {
    const Result result = decode(contents);
    EXPECT_EQ(result.status, 1) << result.error;
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
    EXPECT_THAT(result.error, StartsWith("varnel-decode: "));
    EXPECT_THAT(result.error, HasSubstr(folder.file("capture")));
  }
}

TEST_F(DecodeProgram, AMissingFileIsOneLineAndStatusOne) {
  const Result result = run({"--technology", "kalvi-lte", folder.file("missing")});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_THAT(result.error, HasSubstr(folder.file("missing")));
}

TEST_F(DecodeProgram, AWrongCommandLineIsOneLineAndStatusTwo) {
  const std::string path = write("capture", pcapHeader());
  const std::vector<std::vector<std::string>> wrong = {
      {},
      {"--technology", "kalvi-lte"},
      {"--technology", "kalvi-lte", "--format", "yaml", path},
      {"--technology", "kalvi-lte", "--log-level", "many", path},
      {"--technology", "kalvi-lte", "--log-level", "-2", path},
      {"--technology", "kalvi-lte", "--bogus", path},
      {"--technology", "kalvi-lte", "--snapshot"},
      {"--technology", "kalvi-lte", "--every", "--format", "text", path},
      {"--technology", "kalvi-lte", "--every", "--stats", path},
      {"--technology", "kalvi-lte", "--csv", "A/B", "--format", "json", path},
      {"--technology", "kalvi-lte", "--csv", path},
      {"--technology", "kalvi-lte", "--stats", "--format", "plist", path},
      {"--technology", "kalvi-lte", path, "--plot", folder.file("plot.svg")},
      {"--technology", "kalvi-lte", "--jobs", "0", path},
      {"--technology", "kalvi-lte", "--jobs", "many", path},
      {"--technology", "kalvi-lte", "--snapshot", folder.file("snapshot"), path, path},
      {"--technology", "kalvi-lte", "--dlf", folder.file("dlf"), path, path},
      {"--technology", "kalvi-lte", path, path, "--plot", folder.file("plot.svg"), "A/B"},
      {"--technology", "kalvi-lte", "--format", "plist", path, path},
      {"--technology", "kalvi-lte", "-", "-"},
      {"--technology", "kalvi-lte", ""},
      {"--technology", "kalvi-lte", "--snapshot", "", path},
      {"--technology", "kalvi-lte", "--dlf", "", path},
      {"--technology", "kalvi-lte", path, "--plot", "", "A/B"},
      {"--identities", path, "--plot", folder.file("plot.svg"), "LTE/Registration/M-TMSI"},
      {path, "--plot", folder.file("plot.svg"), "A/B", "NR/Registration/5G-TMSI"},
      {path, "--plot", folder.file("plot.svg"), "A/B", "Modem/Position/Latitude"},
      {path, "--plot", folder.file("plot.svg"), "SIM 1/Subscriber/SIM Info/EF-ICCID"},
      {path, "--plot", folder.file("plot.svg"), "Subscriber/SIM Info/EF-MSISDN"},
      {path, "--plot", folder.file("plot.svg"), "/Subscriber/SIM Info/EF-LOCI"},
      {path, "--plot", folder.file("plot.svg"), "Subscriber/SIM Info/EF-GPRS/PS-LOCI"},
  };
  for (const auto& arguments : wrong) {
    const Result result = run(arguments);
    EXPECT_EQ(result.status, 2) << ::testing::PrintToString(arguments);
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
    EXPECT_THAT(result.error, StartsWith("varnel-decode: "));
  }
}

TEST_F(DecodeProgram, IdentitiesAreNeverDrawn) {
  const Result result = run({"--identities", write("capture", pcapHeader()), "--plot",
                             folder.file("plot.svg"), "LTE/Registration/M-TMSI"});
  EXPECT_EQ(result.error,
            "varnel-decode: --plot never draws identities, and LTE/Registration/M-TMSI is one; see "
            "varnel-decode --help\n");
}

TEST_F(DecodeProgram, AnUnknownTechnologyNamesThoseThatExist) {
  const Result result = run({"--technology", "kalvi-5g", write("capture", pcapHeader())});
  EXPECT_EQ(result.status, 2);
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  for (const char* technology :
       {"kalvi-5g", "ifx-gsm", "kalvi-gsm-umts", "kalvi-cdma", "kalvi-lte", "kalvi-utran-2", "all-radios"}) {
    EXPECT_THAT(result.error, HasSubstr(technology));
  }
}

TEST_F(DecodeProgram, AFileThatWasTakenForAPathIsNamed) {
  const std::string path = write("walk.pcap", pcapHeader());
  const std::string other = write("other.pcap", pcapHeader());
  const std::string plot = folder.file("plot.svg");
  const std::string advice = " took " + path + " for a path; put -- before it; see varnel-decode --help\n";
  struct Case {
    std::vector<std::string> arguments;
    const char* option;
  };
  const Case cases[] = {{{"--csv", path}, "--csv"},
                        {{"--csv", "A/B", path, other}, "--csv"},
                        {{other, "--csv", "A/B", path}, "--csv"},

                        {{"--plot", plot, "A/B", path, other}, "--plot"}};
  for (const auto& [arguments, option] : cases) {
    std::vector<std::string> all = {"--technology", "kalvi-lte"};
    all.insert(all.end(), arguments.begin(), arguments.end());
    const Result result = run(all);
    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(result.error, std::string("varnel-decode: ") + option + advice)
        << ::testing::PrintToString(all);
  }
}

TEST_F(DecodeProgram, HelpNamesTheFolderOfTheTemplates) {
  EXPECT_THAT(run({"--help"}).output, HasSubstr("VARNEL_RESOURCES"));
}

TEST_F(DecodeProgram, HelpIsOnStandardOutput) {
  const Result result = run({"--help"});
  EXPECT_EQ(result.status, 0);
  EXPECT_THAT(result.output, HasSubstr("--snapshot"));
  EXPECT_EQ(result.error, "");
}

TEST_F(DecodeProgram, HelpTellsThatOptionsCanNameTheCaptures) {
  const std::string help = run({"--help"}).output;
  EXPECT_THAT(help, HasSubstr("[CAPTURE...]"));
  EXPECT_THAT(help, Not(HasSubstr("REQUIRED")));
  EXPECT_EQ(run({"-h"}).output, help);
  EXPECT_EQ(run({}).status, 2);
}

TEST_F(DecodeProgram, TheVersionIsOnStandardOutput) {
  const Result result = run({"--version"});
  EXPECT_EQ(result.status, 0);
  EXPECT_THAT(result.output, MatchesRegex("varnel-decode [0-9]+\\.[0-9]+\\.[0-9]+\n"));
  EXPECT_EQ(result.error, "");
}

TEST_F(DecodeProgram, AnEmptyFileIsNamedAsSuch) {
  const std::string path = write("capture", "");
  const Result result = run({"--technology", "kalvi-lte", path});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.error, "varnel-decode: " + path + " is empty, and so no capture\n");
  EXPECT_EQ(result.output, "");
}

TEST_F(DecodeProgram, ASnapshotHoldsTheHistoryByTheCapturesClockAndTheBinaryLog) {
  const std::string path = folder.file("snapshot");
  const Result result = decode(pcapHeader() + pcapRecord(afternoon, 500'000'000, antennas(2)) +
                                   pcapRecord(afternoon + 5, 0, antennas(4)),
                               {"--snapshot", path});
  EXPECT_EQ(result.status, 0) << result.error;
  struct stat file {};
  ASSERT_EQ(::stat(path.c_str(), &file), 0);
  EXPECT_EQ(file.st_mode & 0777, 0600u);

  const std::string contents = contentsOf(path);
  EXPECT_THAT(contents, StartsWith("<?xml"));
  const Value list = readList(contents);
  const Dictionary* snapshot = list.dictionary();
  ASSERT_TRUE(snapshot) << contents;
  ASSERT_TRUE(snapshot->get("Timestamp").string() && snapshot->get("Description").string()) << contents;
  EXPECT_EQ(*snapshot->get("Timestamp").string(), "2024-03-01 14:05:14 +0000");
  EXPECT_EQ(*snapshot->get("Description").string(), "");
  const Array* items = snapshot->get("Data").array();
  ASSERT_TRUE(items) << contents;
  ASSERT_EQ(items->size(), 3u);

  const auto textOf = [&](std::size_t item, std::string_view key) {
    const Dictionary* entries = (*items)[item].dictionary();
    const std::string* text = entries ? entries->get(key).string() : nullptr;
    return text ? *text : "no text";
  };
  EXPECT_EQ(textOf(0, "Date"), "2024-03-01 14:05:11 +0000");
  EXPECT_EQ(textOf(0, "Description"), "Snapshot (2024-03-01 14:05:11 +0000)");
  EXPECT_EQ(textOf(1, "Date"), "2024-03-01 14:05:14 +0000");
  // The 161 bytes of the version report, and the 22 bytes of each interval without the first.
  EXPECT_EQ(textOf(2, "Description"), "DLF binary (203 bytes)");

  const Bytes* dlf = (*items)[2].dictionary()->get("DLF").data();
  ASSERT_TRUE(dlf);
  ASSERT_EQ(dlf->size(), 203u);
  // Seconds, time zone, and daylight saving flag.
  EXPECT_EQ(Bytes(dlf->begin() + 81, dlf->begin() + 89), (Bytes{0x9A, 0xE0, 0xE1, 0x65, 0, 0, 0, 0}));
}

TEST_F(DecodeProgram, TheSnapshotOfAnEmptyCaptureIsOf1970) {
  const std::string path = folder.file("snapshot");
  EXPECT_EQ(decode(pcapHeader(), {"--snapshot", path}).status, 1);
  EXPECT_THAT(contentsOf(path), HasSubstr("<string>1970-01-01 00:00:00 +0000</string>"));
}

TEST_F(DecodeProgram, ASnapshotThatCannotBeWrittenLeavesTheDisplayAndIsStatusOne) {
  const std::string path = folder.file("missing/snapshot");
  const Result result = decode(pcapHeader() + pcapRecord(afternoon, 0, antennas(2)),
                               {"--format", "paths", "--log-level", "-1", "--snapshot", path});
  EXPECT_EQ(result.status, 1);
  EXPECT_THAT(result.output, HasSubstr("\n/Serving Cell Info/Num Tx Antennas\t2\n"));
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_THAT(result.error, HasSubstr(path));
}

TEST_F(DecodeProgram, AnOutputThatCannotBeWrittenIsStatusOne) {
  const std::string path = write("capture", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)));
  for (const char* output : {" >/dev/full", " >&-"}) {
    const Result result = runInShell("--log-level -1 " + path + output);
    EXPECT_EQ(result.status, 1) << output;
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
    EXPECT_THAT(result.error, HasSubstr("standard output"));
  }
}

TEST_F(DecodeProgram, AReaderThatHasLeftIsStatusOneWithoutAWordAndNoSignal) {
  int ends[2];
  ASSERT_EQ(::pipe(ends), 0);
  ::close(ends[0]);
  ASSERT_LT(ends[1], 10) << "the shell takes one digit";
  const std::string path = write("capture", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)));
  const std::string dlf = folder.file("walk.dlf");
  for (const std::string& options : {path, "--every " + path, "--csv A/B -- " + path,
                                     "--jobs 2 " + path + " " + path, "--dlf " + dlf + " " + path}) {
    const Result result = runInShell("--log-level -1 " + options + " >&" + std::to_string(ends[1]));
    EXPECT_EQ(result.status, 1) << options;
    EXPECT_EQ(result.error, "") << options;
  }
  ::close(ends[1]);
  EXPECT_TRUE(std::filesystem::exists(dlf)) << "other outputs are written all the same";
}

}  // namespace

}  // namespace varnel
