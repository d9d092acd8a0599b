#include <gmock/gmock.h>

#include <filesystem>

#include "tests/varnel-decode/DecodeProgram.h"

namespace varnel {
namespace {

using testing::HasSubstr;
using testing::StartsWith;

namespace fs = std::filesystem;

// A capture under several names, and a program that has to write.
class OutputClash : public DecodeProgram {
 protected:
  OutputClash() {
    fs::create_hard_link(capture, folder.file("hard.pcap"));
    fs::create_symlink("walk.pcap", folder.file("soft.pcap"));
  }

  void expectRefusal(const Result& result) const {
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.error, StartsWith("varnel-decode: "));
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
    EXPECT_EQ(contentsOf(capture), bytes);
  }

  const std::string bytes = pcapHeader() + pcapRecord(afternoon, 0, antennas(2));
  const std::string capture = write("walk.pcap", bytes);
};

TEST_F(OutputClash, NoOutputTakesThePlaceOfAnInputByWhateverName) {
  for (const char* option : {"--dlf", "--snapshot", "--records", "--pcap", "--framed", "--messages"}) {
    for (const char* name : {"walk.pcap", "./walk.pcap", "hard.pcap", "soft.pcap"}) {
      const Result result = run({"--technology", "kalvi-lte", option, folder.file(name), capture});
      expectRefusal(result);
      EXPECT_THAT(result.error, HasSubstr(std::string(option) + " " + folder.file(name) +
                                          " would overwrite " + capture + ", which is to be decoded"));
    }
  }
  expectRefusal(run({"--technology", "kalvi-lte", capture, "--plot", folder.file("hard.pcap"), "a/b"}));
}

TEST_F(OutputClash, NoneTakesThePlaceOfWhatComesByStandardInput) {
  const Result result = runInShell("--dlf " + capture + " - < " + capture);
  expectRefusal(result);
  EXPECT_THAT(result.error, HasSubstr("would overwrite standard input"));
}

TEST_F(OutputClash, StandardOutputIsNotAddedToAnInput) {
  const Result result = runInShell(capture + " >> " + folder.file("hard.pcap"));
  expectRefusal(result);
  EXPECT_THAT(result.error, HasSubstr("standard output would overwrite " + capture));
}

TEST_F(OutputClash, TwoOutputsAreTwoFiles) {
  const std::string out = folder.file("out"), same = folder.path() / "." / "out";
  expectRefusal(run({"--technology", "kalvi-lte", "--dlf", out, "--snapshot", same, capture}));
  EXPECT_FALSE(fs::exists(out));
  const Result result = runInShell("--dlf " + out + " " + capture + " > " + out);
  expectRefusal(result);
  EXPECT_THAT(result.error, HasSubstr("standard output and --dlf " + out + " are one file"));
  EXPECT_EQ(contentsOf(out), "");
}

TEST_F(OutputClash, StandardOutputThatGetsNothingMayBeNamed) {
  const std::string out = folder.file("out"), expected = folder.file("expected");
  EXPECT_EQ(runInShell("--format none --dlf " + expected + " " + capture).status, 0);
  EXPECT_EQ(runInShell("--format none --dlf /dev/stdout " + capture + " > " + out).status, 0);
  EXPECT_EQ(contentsOf(out), contentsOf(expected));
}

TEST_F(OutputClash, ADeviceMayGetSeveralOutputs) {
  EXPECT_EQ(runInShell("--format none --dlf /dev/null --snapshot /dev/null " + capture).status, 0);
}

TEST_F(OutputClash, AnOutputThatDoesNotFitLeavesTheEarlierFileAndNoOther) {
  const std::string out = write("out", "last night's");
  Process process("/bin/sh", {"-c", "ulimit -f 1; exec " VARNEL_DECODE_PROGRAM
                                    " --technology kalvi-lte --format none --log-level -1 --snapshot " +
                                        out + " " + capture});
  const Result limited = finish(process);
  EXPECT_EQ(limited.status, 1);
  EXPECT_EQ(limited.error, "varnel-decode: cannot write " + out + ": File too large\n");
  EXPECT_EQ(contentsOf(out), "last night's");
  EXPECT_EQ(std::distance(fs::directory_iterator(folder.path()), {}), 4);
}

TEST_F(OutputClash, WithoutAStandardErrorLogLinesGoNowhere) {
  const std::string out = folder.file("out.varnel");
  const Result result = runInShell("--log-level 7 --format none --snapshot " + out + " " + capture + " 2>&-");
  EXPECT_EQ(result.status, 0);
  EXPECT_THAT(contentsOf(out), StartsWith("<?xml"));
  EXPECT_EQ(contentsOf(capture), bytes);
}

TEST_F(OutputClash, ASnapshotWhoseTextsXmlCannotHoldIsWritten) {
  // Binary lists hold control characters.
  Value context = Value::ofDictionary();
  context.dictionary()->set("apn", "in\x01ternet");
  const Bytes contexts = *writeBinaryPropertyList(Value::ofArray({context}));
  const std::string list = packet(0xFF, 2, std::string(contexts.begin(), contexts.end()));
  write("list.pcap", pcapHeader() + pcapRecord(afternoon, 0, list));
  const std::string out = folder.file("out.varnel");
  const Result result = run({"--technology", "kalvi-lte", "--format", "json", "--log-level", "-1",
                             "--snapshot", out, folder.file("list.pcap")});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_THAT(result.output, HasSubstr("in\\u0001ternet"));
  EXPECT_THAT(contentsOf(out), HasSubstr("<string>in\uFFFDternet</string>"));
}

}  // namespace
}  // namespace varnel
