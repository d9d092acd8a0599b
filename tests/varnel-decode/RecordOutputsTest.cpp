#include <gmock/gmock.h>

#include <cstdlib>
#include <filesystem>

#include "host/captures/Capture.h"
#include "platform/TelephonyService.h"
#include "tests/support/SimulatedMessages.h"
#include "tests/varnel-decode/DecodeProgram.h"

// Runs the whole program as a converter of captures.

namespace varnel {
namespace {

using testing::HasSubstr;
using testing::StartsWith;

using DecodeRecords = DecodeProgram;

struct Kept {
  char logType;
  Time time;
  std::string record;  // from the log code on, without length and time
  std::optional<std::uint8_t> subscription;
};

std::vector<Kept> recordsIn(const std::string& path) {
  std::vector<Kept> records;
  const auto capture = openCapture(path);
  for (CaptureRecord record; capture->next(record);) {
    std::string text(record.message.begin(), record.message.end());
    if (text[0] == '\x81') text.erase(0, 2);
    records.push_back({text[0], record.time, text.substr(3, 2) + text.substr(13), record.subscription});
  }
  return records;
}

// A minute of a simulated modem as pcap, with some messages that are no log records.
std::string simulatedCapture(std::size_t& records) {
  std::string capture = pcapHeader() + pcapRecord(afternoon, 0, simFiles("<dict/>"));
  records = 0;
  for (const SimulatedPacket& message : simulatedMessages(technology::kalviLTE, 1, std::chrono::minutes(1))) {
    const std::string bytes(message.packet.begin(), message.packet.end());
    const auto index = static_cast<std::uint32_t>(records);
    if (bytes[0] == 1) ++records;
    capture += pcapRecord(afternoon + index / 10, index % 10 * 100'000'000, bytes);
  }
  return capture + pcapRecord(afternoon + 60, 0, pdpContexts("<array/>"));
}

std::int64_t nanosecondsBetween(Time one, Time other) {
  return (other.seconds - one.seconds) * 1'000'000'000 + other.nanoseconds - one.nanoseconds;
}

TEST_F(DecodeRecords, EveryRecordGoesThroughAllFormsWithItsTime) {
  std::size_t count = 0;
  const std::string source = write("source", simulatedCapture(count));
  ASSERT_GT(count, 100u);
  const std::string framed = folder.file("framed"), stream = folder.file("stream"),
                    pcap = folder.file("pcap"), framedAgain = folder.file("framed2");
  EXPECT_EQ(run({"--format", "none", "--framed", framed, source}).status, 0);
  EXPECT_EQ(run({"--format", "none", "--records", stream, framed}).error, "");
  EXPECT_EQ(run({"--format", "none", "--pcap", pcap, stream}).error, "");
  EXPECT_EQ(run({"--format", "none", "--framed", framedAgain, pcap}).error, "");
  EXPECT_EQ(contentsOf(framedAgain), contentsOf(framed));

  std::vector<Kept> expected = recordsIn(source);
  std::erase_if(expected, [](const Kept& kept) { return kept.logType != 1; });
  const std::vector<Kept> found = recordsIn(framedAgain);
  ASSERT_EQ(found.size(), count);
  ASSERT_EQ(expected.size(), count);
  for (std::size_t i = 0; i < count; ++i) {
    EXPECT_EQ(found[i].record, expected[i].record) << i;
    // The modem's clock ticks 49152 times in 1.25 ms.
    EXPECT_LT(std::abs(nanosecondsBetween(found[i].time, expected[i].time)), 27) << i;
  }
}

TEST_F(DecodeRecords, MessagesThatAreNoLogRecordsAreLeftOutAndCounted) {
  const std::string source = write("source", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) +
                                                 pcapRecord(afternoon, 0, simFiles("<dict/>")) +
                                                 pcapRecord(afternoon, 0, pdpContexts("<array/>")));
  const std::string stream = folder.file("stream"), pcap = folder.file("pcap");
  const Result result = run({"--format", "none", "--records", stream, "--pcap", pcap, source});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error, "varnel-decode: 2 messages of " + source +
                              " did not come from a modem as log records (of log type 1), so " + stream +
                              " is without them\n");
  EXPECT_EQ(recordsIn(stream).size(), 1u);
  EXPECT_EQ(contentsOf(pcap).substr(24), contentsOf(source).substr(24)) << "which has a place for each";
}

TEST_F(DecodeRecords, RecordsAreWrittenEvenIfATableCannotBe) {
  const std::string source = write("source", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) +
                                                 pcapRecord(afternoon + 5, 0, antennas(4)));
  const std::string stream = folder.file("stream");
  const Result result = runInShell("--log-level -1 --records " + stream +
                                   " --csv 'Serving Cell Info/Num Tx Antennas' -- " + source + " >/dev/full");
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.error, "varnel-decode: cannot write to standard output: No space left on device\n");
  EXPECT_EQ(recordsIn(stream).size(), 2u);
}

TEST_F(DecodeRecords, RecordsAreWrittenBesideWhateverIsDecoded) {
  const std::string source = write("source", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)));
  const std::string stream = folder.file("stream");
  const Result result = run({"--technology", "kalvi-lte", "--csv", "Serving Cell Info/Num Tx Antennas",
                             "--records", stream, source});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_THAT(result.output, HasSubstr(",2\n"));
  // Length, code, then the modem's time of 2024-03-01 14:05:09: 1393337109 s in 1.25 ms, 1114669687200 of
  // them.
  EXPECT_EQ(contentsOf(stream), littleEndian(21, 2) + littleEndian(0xB0C1, 2) +
                                    littleEndian(1'114'669'687'200ULL << 16, 8) + std::string(7, '\0') +
                                    '\2' + '\0');
}

TEST_F(DecodeRecords, ACaptureWithoutRecordsLeavesTheEarlierFile) {
  const std::string out = write("out", "last night's");
  const Result result = run({"--format", "none", "--framed", out, write("source", pcapHeader())});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_EQ(contentsOf(out), "last night's");
}

TEST_F(DecodeRecords, AFileThatDoesNotFitLeavesTheEarlierOneAndNoOther) {
  std::string capture = pcapHeader();
  for (std::uint32_t i = 0; i < 10'000; ++i) capture += pcapRecord(afternoon + i, 0, antennas(2));
  const std::string source = write("source", capture), out = write("out", "last night's");
  Process process("/bin/sh", {"-c", "ulimit -f 1; exec " VARNEL_DECODE_PROGRAM " --format none --framed " +
                                        out + " " + source});
  const Result result = finish(process);
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.error, "varnel-decode: cannot write " + out + ": File too large\n");
  EXPECT_EQ(contentsOf(out), "last night's");
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(folder.path()), {}), 2);
}

TEST_F(DecodeRecords, APipeGetsThem) {
  const std::string source = write("source", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)));
  const Result result = runInShell("--format none --pcap /dev/stdout " + source + " | cat");
  EXPECT_EQ(result.output.substr(24), contentsOf(source).substr(24)) << "behind the header of the file";
}

TEST_F(DecodeRecords, TheExampleIsAWholeWalk) {
  const std::string example = VARNEL_SOURCE_DIR "/docs/examples/lte-walk.framed";
  const Result table = run({"--technology", "kalvi-lte", "--stats", example});
  EXPECT_EQ(table.error, "");
  EXPECT_EQ(
      table.output,
      "Log code        Received      Decoded    Too short     Too long      Unknown  Unknown version\n"
      "0xB0C1                21           21            0            0            0                0\n"
      "0xB0C2                26           26            0            0            0                0\n"
      "0xB179                67           67            0            0            0                0\n"
      "0xB17F                47           47            0            0            0                0\n"
      "0xB180                24           24            0            0            0                0\n"
      "0xB186                21           21            0            0            0                0\n"
      "Total                206          206            0            0            0                0\n");
  const Result values = run({"--technology", "kalvi-lte", "--numbers", "--csv",
                             "Serving Cell Measurements/Average RSRP", "--", example});
  EXPECT_THAT(values.output, StartsWith("Time,Serving Cell Measurements/Average RSRP [dBm]\n"
                                        "2026-11-22T06:10:44.909Z,-82.00\n"
                                        "2026-11-22T06:10:46.909Z,-78.25\n"));
}

// Antennas of SIM 2, of SIM 1, and of none.
std::string twoSims() {
  return pcapHeader() + pcapRecord(afternoon, 0, "\x81\x02" + antennas(4)) +
         pcapRecord(afternoon + 1, 0, "\x81\x01" + antennas(8)) +
         pcapRecord(afternoon + 2, 0, std::string("\x81\0", 2) + antennas(2));
}

TEST_F(DecodeRecords, OfTwoSimsTheFirstIsDecodedWhichIsTold) {
  const Result result = decode(twoSims(), {"--csv", "Serving Cell Info/Num Tx Antennas", "--"});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.output,
            "Time,Serving Cell Info/Num Tx Antennas\n"
            "2024-03-01T14:05:11.000Z,4\n"
            "2024-03-01T14:05:11.000Z,2\n");
  EXPECT_EQ(result.error,
            "varnel-decode: " + folder.file("capture") +
                " has records of SIM 2, which are decoded, and of SIM 1, which are not; choose by "
                "--sim\n");
}

// A serving cell of LTE on EARFCN 5230.
std::string servingCell(std::uint16_t physicalCell) {
  return packet(1, 0xB0C2,
                littleEndian(3, 1) + littleEndian(physicalCell, 2) + littleEndian(5230, 4) +
                    littleEndian(23230, 4) + std::string(18, '\0'));
}

TEST_F(DecodeRecords, AllRadiosShowBothSimsSideBySide) {
  const std::string path = folder.file("capture");
  std::ofstream(path, std::ios::binary)
      << pcapHeader() << pcapRecord(afternoon, 0, "\x81\x02" + servingCell(4))
      << pcapRecord(afternoon, 0, "\x81\x01" + servingCell(8)) << pcapRecord(afternoon, 0, servingCell(2));
  const std::vector<std::string> all = {path, "--csv", "LTE/Serving Cell/Physical Cell ID",
                                        "SIM 1/LTE/Serving Cell/Physical Cell ID",
                                        "SIM 2/LTE/Serving Cell/Physical Cell ID"};
  const Result both = run(all);
  EXPECT_EQ(both.status, 0);
  EXPECT_EQ(both.error, "");
  EXPECT_THAT(both.output, HasSubstr("\n2024-03-01T14:05:09.000Z,2,8,4\n"));
  std::vector<std::string> one = {"--sim", "1"};
  one.insert(one.end(), all.begin(), all.end());
  EXPECT_THAT(run(one).output, HasSubstr("\n2024-03-01T14:05:09.000Z,2,8,\n"));
}

TEST_F(DecodeRecords, SimChoosesOne) {
  const Result result = decode(twoSims(), {"--sim", "1", "--stats"});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error, "");
  EXPECT_EQ(result.output,
            "Log code        Received      Decoded    Too short     Too long      Unknown  Unknown version\n"
            "0xB0C1                 2            2            0            0            0                0\n"
            "Total                  2            2            0            0            0                0\n"
            "\n"
            "No SIM                 1\n"
            "SIM 1                  1\n"
            "SIM 2                  1\n");
  const std::string one = folder.file("one"), all = folder.file("all");
  EXPECT_EQ(run({"--format", "none", "--sim", "1", "--framed", one, folder.file("capture")}).status, 0);
  EXPECT_EQ(run({"--format", "none", "--framed", all, folder.file("capture")}).status, 0);
  EXPECT_EQ(recordsIn(one).size(), 2u);
  ASSERT_EQ(recordsIn(all).size(), 3u) << "nothing is lost that nobody has chosen";
  EXPECT_EQ(recordsIn(all)[0].subscription, 2);
}

TEST_F(DecodeRecords, ASimWithoutRecordsIsOneLine) {
  const Result result =
      decode(pcapHeader() + pcapRecord(afternoon, 0, "\x81\x02" + antennas(4)), {"--sim", "1", "--every"});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(result.error,
            "varnel-decode: " + folder.file("capture") + " has no records of SIM 1; it has those of SIM 2\n");
}

TEST_F(DecodeRecords, StatisticsCountTheFramesThatWereLeftOut) {
  const std::string framed = folder.file("framed");
  write("source", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) +
                      pcapRecord(afternoon, 0, antennas(4)) + pcapRecord(afternoon, 0, antennas(8)));
  ASSERT_EQ(run({"--format", "none", "--framed", framed, folder.file("source")}).status, 0);
  std::string bytes = contentsOf(framed);
  const std::size_t second = bytes.find('\x7E') + 1;
  bytes[second + 24] ^= 0x40;
  const std::string path = write("damaged", bytes);
  const Result table = run({"--technology", "kalvi-lte", "--stats", path});
  EXPECT_THAT(table.output, HasSubstr("\nTotal                  2            2 "));
  EXPECT_THAT(
      table.output,
      HasSubstr("\n\nFrames                 3\nRecords                2\nBad checksum           1\n"));
  const Result json = run({"--technology", "kalvi-lte", "--stats", "--format", "json", path});
  EXPECT_THAT(json.output, HasSubstr(R"("Frames":{"Received":3,"Records":2,"Bad checksum":1,)"));
}

}  // namespace
}  // namespace varnel
