#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <map>
#include <ostream>
#include <string>
#include <vector>

#include "tests/support/Process.h"

// What ./dev decoder does to a checkout. That its skeleton compiles and passes is what recipe_tests show.

namespace varnel {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class NewDecoder : public testing::Test {
 protected:
  using Files = std::map<std::string, std::string>;
  using Arguments = std::vector<std::string>;

  struct Result {
    int status;
    std::string output, error;
  };

  NewDecoder() {
    for (const char* part :
         {"dev", "tools/new-decoder", "LogGenerator", "platform", "base", "resources", "docs/formats.md",
          "tests/CMakeLists.txt", "tests/LogGenerator", "tests/support"}) {
      const fs::path copy = _folder.path() / part;
      fs::create_directories(copy.parent_path());
      fs::copy(fs::path(VARNEL_SOURCE_DIR) / part, copy, fs::copy_options::recursive);
    }
    before = files();
  }

  Result decoder(Arguments arguments) {
    arguments.insert(arguments.begin(), "decoder");
    Process process(_folder.file("dev"), arguments);
    EXPECT_TRUE(process.waitForEnd());
    return {process.exitStatus(), process.output(), process.error()};
  }

  Files files() const {
    Files contents;
    for (const auto& entry : fs::recursive_directory_iterator(_folder.path())) {
      if (entry.is_regular_file())
        contents[fs::relative(entry.path(), _folder.path())] = contentsOf(entry.path());
    }
    return contents;
  }

  // The files that differ from those in the beginning.
  std::vector<std::string> touched() const {
    std::vector<std::string> names;
    const Files after = files();
    for (const auto& [name, contents] : after) {
      if (!before.contains(name) || before.at(name) != contents) names.push_back(name);
    }
    for (const auto& [name, contents] : before) {
      if (!after.contains(name)) names.push_back(name + " is gone");
    }
    return names;
  }

  std::string text(const std::string& name) const { return contentsOf(_folder.file(name)); }

  // Puts a folder where the command writes a file.
  void block(const std::string& name) const { fs::create_directory(_folder.path() / name); }

  Files before;

 private:
  TemporaryFolder _folder;
};

TEST_F(NewDecoder, IsEightFiles) {
  const Result result = decoder({"LTE", "A0Burst", "0x0001", "18"});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_THAT(touched(), ElementsAre("LogGenerator/CMakeLists.txt", "LogGenerator/KLV/LTE/A0Burst.cpp",
                                     "LogGenerator/KLV/LTE/A0Burst.h", "LogGenerator/KLV/LTE/LTEClassIndex.h",
                                     "docs/formats.md", "resources/LTE.plist", "tests/CMakeLists.txt",
                                     "tests/LogGenerator/KLV/LTE/A0BurstTest.cpp"));
  for (const std::string& name : touched()) EXPECT_THAT(result.output, HasSubstr("  " + name + "\n"));
  EXPECT_THAT(result.output, HasSubstr("Left to do, in this order:\n1. LogGenerator/KLV/LTE/A0Burst.cpp"));
}

TEST_F(NewDecoder, HasAnEntryInEachList) {
  ASSERT_EQ(decoder({"LTE", "A0Burst", "0x0001", "18"}).status, 0);
  EXPECT_THAT(text("LogGenerator/KLV/LTE/LTEClassIndex.h"),
              testing::AllOf(HasSubstr("#include \"LogGenerator/ClassIndex.h\"\n"
                                       "#include \"LogGenerator/KLV/LTE/A0Burst.h\"\n"
                                       "#include \"LogGenerator/KLV/LTE/"),
                             HasSubstr("  std::unique_ptr<A0Burst> objA0Burst = create<A0Burst>();\n"
                                       "};\n")));
  EXPECT_THAT(text("LogGenerator/CMakeLists.txt"), HasSubstr("    KLV/LTE/A0Burst.cpp\n    KLV/Subscriber/"));
  EXPECT_THAT(text("tests/CMakeLists.txt"),
              HasSubstr("    LogGenerator/KLV/LTE/A0BurstTest.cpp\n    LogGenerator/KLV/Subscriber/"));
  EXPECT_THAT(text("resources/LTE.plist"), HasSubstr("\t<key>A0 Burst</key>\n"
                                                     "\t<dict>\n"
                                                     "\t\t<key>Version</key>\n"
                                                     "\t\t<string></string>\n"
                                                     "\t</dict>\n"
                                                     "</dict>\n"
                                                     "</plist>\n"));
  EXPECT_THAT(text("docs/formats.md"), HasSubstr("LTE (`kalvi-lte`):\n\n"
                                                 "| log code | length | sections |\n"
                                                 "| --- | --- | --- |\n"
                                                 "| 0x0001 | 18 | \"A0 Burst\" |\n"));
}

TEST_F(NewDecoder, ComesAfterAnotherOne) {
  ASSERT_EQ(decoder({"GSMUMTS", "A0Burst", "0x001F", "18"}).status, 0);
  ASSERT_EQ(decoder({"GSMUMTS", "A1Burst", "31", "14"}).status, 0);
  ASSERT_EQ(decoder({"GSMUMTS", "A2Burst", "0x1e", "14"}).status, 0);
  EXPECT_THAT(text("LogGenerator/KLV/GSMUMTS/KLV_GSMClassIndex.h"),
              HasSubstr("  std::unique_ptr<A0Burst> objA0Burst = create<A0Burst>();\n"
                        "  std::unique_ptr<A1Burst> objA1Burst = create<A1Burst>();\n"
                        "  std::unique_ptr<A2Burst> objA2Burst = create<A2Burst>();\n"
                        "};\n"));
  EXPECT_THAT(text("LogGenerator/KLV/GSMUMTS/A1Burst.cpp"), HasSubstr("{0x001F, 14, fields}"));
  EXPECT_THAT(text("docs/formats.md"), HasSubstr("\n| 0x001E | 14 | \"A2 Burst\" |\n"
                                                 "| 0x001F | 18 | \"A0 Burst\"; \"A1 Burst\" |\n"));
}

TEST_F(NewDecoder, OfPacketsWithoutPayloadShowsTheLogType) {
  ASSERT_EQ(decoder({"UTRAN", "LTEBurstB2", "0xFFFF", "13"}).status, 0);
  EXPECT_THAT(text("LogGenerator/KLV/UTRAN/LTEBurstB2.cpp"), HasSubstr("{u8(0), \"Log Type\"},"));
  EXPECT_THAT(text("resources/UTRAN.plist"),
              HasSubstr("<key>LTE Burst B2</key>\n\t<dict>\n\t\t<key>Log Type</key>"));
}

TEST_F(NewDecoder, IsRefusedWithOneLineAndThenNothingChanges) {
  const struct {
    Arguments arguments;
    std::string error;
  } refused[] = {
      {{"GSM", "A0Burst", "0xB168", "18"}, "there is no index 'GSM'; give one of LTE, UTRAN, GSMUMTS"},
      {{"LTE", "DetectedCells", "0xB168", "18"},
       "the name 'DetectedCells' exists, in LogGenerator/KLV/LTE/DetectedCells.cpp; take another one"},
      {{"LTE", "simInfo", "0xB168", "18"},
       "'simInfo' is no name of a class; give letters and digits, the first a capital: RandomAccess"},
      {{"LTE", "A0-Burst", "0xB168", "18"},
       "'A0-Burst' is no name of a class; give letters and digits, the first a capital: RandomAccess"},
      {{"LTE", "SectionFormats", "0xB168", "18"},
       "the name 'SectionFormats' exists, in LogGenerator/NumberFormats.h; take another one"},
      {{"LTE", "PacketBuilder", "0xB168", "18"},
       "the name 'PacketBuilder' exists, in tests/support/PacketBuilder.h; take another one"},
      {{"UTRAN", "NeighborCellList", "0xB168", "18"},
       "the section \"Neighbor Cell List\" exists, in resources/UTRAN.plist; take a name that makes another "
       "one"},
      {{"LTE", "A0Burst", "0x10000", "18"},
       "the log code '0x10000' is no 16-bit number; give one from 0x0000 to 0xFFFF"},
      {{"LTE", "A0Burst", "B168", "18"},
       "the log code 'B168' is no 16-bit number; give one from 0x0000 to 0xFFFF"},
      {{"LTE", "A0Burst", "0xB168", "12"},
       "the length '12' is none of a packet; give its shortest one in bytes, header included: 13 to 65535"},
      {{"LTE", "A0Burst", "0xB168", "65536"},
       "the length '65536' is none of a packet; give its shortest one in bytes, header included: 13 to "
       "65535"},
      {{"LTE", "A0Burst"},
       "usage: ./dev decoder INDEX NAME CODE LENGTH, such as ./dev decoder LTE RandomAccess 0xB168 18"},
  };
  for (const auto& [arguments, error] : refused) {
    const Result result = decoder(arguments);
    EXPECT_EQ(result.status, 2) << error;
    EXPECT_EQ(result.error, "./dev decoder: " + error + "\n");
    EXPECT_EQ(result.output, "");
    EXPECT_THAT(touched(), IsEmpty()) << error;
  }
}

TEST_F(NewDecoder, IsWrittenAsAWholeOrNotAtAll) {
  block("docs/formats.md.new");
  const Result result = decoder({"LTE", "A0Burst", "0x0001", "18"});
  EXPECT_EQ(result.status, 1);
  EXPECT_THAT(result.error, testing::MatchesRegex("./dev decoder: nothing was written: Is a directory: "
                                                  ".*/docs/formats.md.new; .*\n"));
  EXPECT_THAT(touched(), IsEmpty());
}

}  // namespace
}  // namespace varnel
