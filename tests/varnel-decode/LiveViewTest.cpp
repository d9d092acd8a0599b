#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/stat.h>
#include <unistd.h>

#include <csignal>

#include "tests/varnel-decode/DecodeProgram.h"

// Runs the whole program on captures that still grow.

namespace varnel {
namespace {

using testing::HasSubstr;

std::string antennasAt(std::uint32_t second, char count) {
  return pcapRecord(afternoon + second, 0, antennas(count));
}

class DecodeLive : public DecodeProgram {
 protected:
  static void append(int descriptor, const std::string& bytes) {
    ASSERT_EQ(::write(descriptor, bytes.data(), bytes.size()), static_cast<ssize_t>(bytes.size()));
  }
  static bool shows(const Process& process, const std::string& line) {
    return eventually([&] { return process.output().find(line) != std::string::npos; });
  }
  const std::vector<std::string> table = {"--technology", "kalvi-lte", "--csv",
                                          "Serving Cell Info/Num Tx Antennas"};
  std::vector<std::string> tableOf(const std::vector<std::string>& rest) const {
    std::vector<std::string> arguments = table;
    arguments.insert(arguments.end(), rest.begin(), rest.end());
    return arguments;
  }
};

TEST_F(DecodeLive, ADisplayOfAPipeIsWrittenWithTheFirstRecordBehindIt) {
  const std::string pipe = folder.file("pipe");
  ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
  Process process(VARNEL_DECODE_PROGRAM, tableOf({"--", pipe}));
  const int writer = ::open(pipe.c_str(), O_WRONLY | O_CLOEXEC);
  ASSERT_GE(writer, 0);
  append(writer, pcapHeader() + antennasAt(0, 2) + antennasAt(1, 4) + antennasAt(2, 8));
  EXPECT_TRUE(shows(process, "2024-03-01T14:05:11.000Z,4\n"));
  append(writer, antennasAt(4, 1));
  EXPECT_TRUE(shows(process, "2024-03-01T14:05:13.000Z,8\n"));
  ::close(writer);
  const Result result = finish(process);
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(result.output,
            "Time,Serving Cell Info/Num Tx Antennas\n"
            "2024-03-01T14:05:11.000Z,4\n"
            "2024-03-01T14:05:13.000Z,8\n"
            "2024-03-01T14:05:13.000Z,1\n");
}

TEST_F(DecodeLive, FollowGoesOnWhereTheFileEndedUntilItIsInterrupted) {
  const std::string path = write("capture", pcapHeader() + antennasAt(0, 2) + antennasAt(2, 4));
  Process process(VARNEL_DECODE_PROGRAM, tableOf({"--follow", path}));
  EXPECT_TRUE(shows(process, "2024-03-01T14:05:11.000Z,2\n"));
  const int writer = ::open(path.c_str(), O_WRONLY | O_APPEND | O_CLOEXEC);
  ASSERT_GE(writer, 0);
  const std::string record = antennasAt(4, 8);
  append(writer, record.substr(0, 20));
  append(writer, record.substr(20));
  ::close(writer);
  EXPECT_TRUE(shows(process, "2024-03-01T14:05:13.000Z,4\n"));
  process.signal(SIGINT);
  ASSERT_TRUE(process.waitForEnd());
  EXPECT_EQ(process.exitStatus(), -SIGINT);
}

TEST_F(DecodeLive, WhatIsWrittenAtTheEndDoesNotGoWithFollow) {
  const std::string path = write("capture", pcapHeader() + antennasAt(0, 2));
  for (const char* option : {"--snapshot", "--dlf", "--records", "--pcap", "--framed"}) {
    const Result result =
        run({"--technology", "kalvi-lte", "--every", "--follow", option, folder.file("out"), path});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.error,
                HasSubstr(std::string("--follow has no end, at which ") + option + " is written"));
  }
}

}  // namespace
}  // namespace varnel
