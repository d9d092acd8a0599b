#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/stat.h>
#include <unistd.h>

#include "tests/support/AirMessages.h"
#include "tests/varnel-decode/DecodeProgram.h"

// Runs the whole program with --events.

namespace varnel {
namespace {

using testing::HasSubstr;
using testing::StartsWith;

// A serving cell of LTE.
std::string servingCell(std::uint32_t earfcn, std::uint16_t physicalCell, std::uint8_t version = 3) {
  return packet(1, 0xB0C2,
                littleEndian(version, 1) + littleEndian(physicalCell, 2) + littleEndian(earfcn, 4) +
                    std::string(22, '\0'));
}

// The state and substate of the EPS mobility management, without an identity.
std::string registration(std::uint8_t state, std::uint16_t substate) {
  return packet(
      1, 0xB0EE,
      littleEndian(2, 1) + littleEndian(state, 1) + littleEndian(substate, 2) + std::string(15, '\0'));
}

// A message of RRC on the channel of that number: 9 is DL-DCCH, 11 is UL-DCCH.
std::string rrcMessage(unsigned channel, std::uint8_t firstByte) {
  const Bytes message = lteRRCPacket(channel, {firstByte});
  return {message.begin(), message.end()};
}

const std::string firstCell =
    "2024-03-01T14:05:09.000Z  cell change        LTE/Serving Cell                EARFCN 5230, Physical Cell "
    "ID 16, Cell Identity 0\n";

class DecodeEvents : public DecodeProgram {
 protected:
  // A record per second.
  std::string captureOf(const std::string& name, const std::vector<std::string>& messages) const {
    std::string contents = pcapHeader();
    std::uint32_t second = afternoon;
    for (const std::string& message : messages) contents += pcapRecord(second++, 0, message);
    return write(name, contents);
  }
  std::string drive() const {
    return captureOf("drive.pcap", {servingCell(5230, 16), registration(3, 0), servingCell(5230, 16),
                                    servingCell(1300, 18), registration(3, 4), servingCell(1300, 18, 99)});
  }
};

TEST_F(DecodeEvents, EachEventIsALineWithTheTimeOfItsRecord) {
  const Result result = run({"--events", drive()});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error, "");
  EXPECT_EQ(result.output,
            firstCell +
                "2024-03-01T14:05:10.000Z  registration       LTE/Registration                Registered\n"
                "2024-03-01T14:05:12.000Z  cell change        LTE/Serving Cell                EARFCN 5230, "
                "Physical Cell ID 16, Cell Identity 0 -> EARFCN 1300, Physical Cell ID 18, Cell Identity 0\n"
                "2024-03-01T14:05:13.000Z  loss of service    LTE/Registration                Normal Service "
                "-> PLMN Search\n"
                "2024-03-01T14:05:14.000Z  unknown version    LTE/Serving Cell                3 -> 99\n");
}

TEST_F(DecodeEvents, ACellChangeWithinAConnectionIsAHandover) {
  const std::string setupComplete = rrcMessage(11, 0x20), release = rrcMessage(9, 0x28);
  const std::string path = captureOf("drive.pcap", {servingCell(5230, 16), setupComplete,
                                                    servingCell(1300, 17), release, servingCell(1300, 18)});
  EXPECT_EQ(
      run({"--events", "--format", "csv", path}).output,
      "Time,Kind,From,To,Section,Elapsed\n"
      "2024-03-01T14:05:09.000Z,cell change,,\"EARFCN 5230, Physical Cell ID 16, Cell Identity "
      "0\",LTE/Serving Cell,0.000\n"
      "2024-03-01T14:05:10.000Z,RRC connection,,Connected,LTE/Connection,1.000\n"
      "2024-03-01T14:05:11.000Z,handover,\"EARFCN 5230, Physical Cell ID 16, Cell Identity 0\",\"EARFCN "
      "1300, Physical Cell ID 17, Cell Identity 0\",LTE/Serving Cell,2.000\n"
      "2024-03-01T14:05:12.000Z,RRC connection,Connected,Idle,LTE/Connection,3.000\n"
      "2024-03-01T14:05:13.000Z,cell change,\"EARFCN 1300, Physical Cell ID 17, Cell Identity "
      "0\",\"EARFCN 1300, Physical Cell ID 18, Cell Identity 0\",LTE/Serving Cell,4.000\n");
}

TEST_F(DecodeEvents, JsonAndCsvHaveTheSame) {
  const std::string path = drive();
  const Result json = run({"--events", "--format", "json", path});
  EXPECT_EQ(linesOf(json.output), 5u) << json.output;
  EXPECT_THAT(json.output, HasSubstr("\n{\"Time\":\"2024-03-01T14:05:13.000Z\",\"Kind\":\"loss of "
                                     "service\",\"From\":\"Normal Service\",\"To\":\"PLMN "
                                     "Search\",\"Section\":\"LTE/Registration\"}\n"));
  const Result csv = run({"--events", "--format", "csv", path});
  EXPECT_EQ(linesOf(csv.output), 6u) << csv.output;
  EXPECT_THAT(csv.output, StartsWith("Time,Kind,From,To,Section,Elapsed\n"));
  EXPECT_THAT(csv.output, HasSubstr("\n2024-03-01T14:05:13.000Z,loss of service,Normal Service,PLMN "
                                    "Search,LTE/Registration,4.000\n"));
}

TEST_F(DecodeEvents, ACaptureOfAnotherTechnologyIsReadAsOneOfAllRadios) {
  const std::string header =
      pcapngBlock(0x0A0D0D0A, littleEndian(0x1A2B3C4D, 4) + littleEndian(1, 4) + std::string(8, '\xFF'));
  const std::string interface =
      pcapngBlock(1, littleEndian(user0, 4) + littleEndian(0, 4) + littleEndian(3, 2) + littleEndian(9, 2) +
                         "kalvi-lte" + std::string(3, '\0') + std::string(4, '\0'));
  const std::string message = servingCell(5230, 16);
  const std::uint64_t microseconds = std::uint64_t{afternoon} * 1'000'000;
  const std::string record = pcapngBlock(
      6, littleEndian(0, 4) + littleEndian(microseconds >> 32, 4) + littleEndian(microseconds, 4) +
             littleEndian(message.size(), 4) + littleEndian(message.size(), 4) + message);
  EXPECT_EQ(run({"--events", write("walk.pcapng", header + interface + record)}).output, firstCell);
}

TEST_F(DecodeEvents, EachSimCardHasItsOwnUnlessOneIsWanted) {
  const std::string path =
      captureOf("two.pcap", {"\x81\x01" + servingCell(5230, 16), "\x81\x02" + servingCell(1300, 17)});
  const Result both = run({"--events", path});
  EXPECT_EQ(both.error, "");
  EXPECT_EQ(linesOf(both.output), 2u);
  EXPECT_THAT(both.output, HasSubstr("  SIM 1/LTE/Serving Cell  "));
  EXPECT_THAT(both.output, HasSubstr("  SIM 2/LTE/Serving Cell  "));
  const Result second = run({"--events", "--sim", "2", path});
  EXPECT_EQ(linesOf(second.output), 1u);
  EXPECT_THAT(second.output, HasSubstr("  SIM 2/LTE/Serving Cell  "));
}

TEST_F(DecodeEvents, OfSeveralCapturesEachIsNamed) {
  const std::string a = captureOf("a.pcap", {servingCell(5230, 16)});
  const std::string b = captureOf("b.pcap", {servingCell(5230, 16)});
  EXPECT_EQ(run({"--events", a, b}).output,
            "==> " + a + " <==\n" + firstCell + "\n==> " + b + " <==\n" + firstCell);
  const std::string values =
      ",2024-03-01T14:05:09.000Z,cell change,,\"EARFCN 5230, Physical Cell ID 16, Cell "
      "Identity 0\",LTE/Serving Cell,0.000\n";
  EXPECT_EQ(run({"--events", "--format", "csv", "--jobs", "2", a, b}).output,
            "Capture,Time,Kind,From,To,Section,Elapsed\n" + a + values + b + values);
}

TEST_F(DecodeEvents, AnEventOfAPipeIsWrittenAtOnce) {
  const std::string pipe = folder.file("pipe");
  ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
  Process process(VARNEL_DECODE_PROGRAM, {"--events", pipe});
  const int writer = ::open(pipe.c_str(), O_WRONLY | O_CLOEXEC);
  ASSERT_GE(writer, 0);
  const std::string bytes = pcapHeader() + pcapRecord(afternoon, 0, servingCell(5230, 16));
  ASSERT_EQ(::write(writer, bytes.data(), bytes.size()), static_cast<ssize_t>(bytes.size()));
  EXPECT_TRUE(eventually([&] { return process.output() == firstCell; }));
  ::close(writer);
  EXPECT_EQ(finish(process).status, 0);
}

TEST_F(DecodeEvents, OutputThatCannotBeWrittenIsAnError) {
  const std::string path = drive();
  Process process("/bin/sh", {"-c", "exec " VARNEL_DECODE_PROGRAM " --events " + path + " > /dev/full"});
  const Result result = finish(process);
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
}

TEST_F(DecodeEvents, WhatDoesNotGoWithThemIsAMistake) {
  const std::string path = drive();
  const std::vector<std::vector<std::string>> wrong = {
      {"--events", "--technology", "kalvi-lte", path},
      {"--events", "--format", "plist", path},
      {"--events", "--format", "none", path},
      {"--events", "--every", path},
      {"--events", "--stats", path},
      {"--events", "--numbers", path},
      {"--events", path, "--csv", "A/B"},
      {"--format", "csv", path},
      {"--stats", "--format", "csv", path},
      {"--every", "--format", "csv", path},
  };
  for (const auto& arguments : wrong) {
    const Result result = run(arguments);
    EXPECT_EQ(result.status, 2) << testing::PrintToString(arguments);
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  }
  EXPECT_EQ(run({"--events", "--technology", "all-radios", path}).status, 0);
}

TEST_F(DecodeEvents, ASnapshotHasNone) {
  const std::string saved = folder.file("saved");
  EXPECT_EQ(run({"--format", "none", "--snapshot", saved, drive()}).status, 0);
  const Result result = run({"--events", saved});
  EXPECT_EQ(result.status, 2);
  EXPECT_THAT(result.error, HasSubstr("--events tells what happened in captures, but "));
}

}  // namespace
}  // namespace varnel
