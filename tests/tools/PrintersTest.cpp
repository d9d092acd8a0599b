#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "tests/support/Process.h"
#include "tests/support/Tool.h"

// What gdb shows of the variables of ValuesForGdb.cpp with tools/gdb/printers.py.

namespace varnel {
namespace {

using testing::ElementsAre;

class Printers : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    const auto gdb = gdbAfter({"run"});
    isTracingForbidden = gdb->error().find("Could not trace the inferior process") != std::string::npos;
  }

  void SetUp() override {
    if (isTracingForbidden) GTEST_SKIP() << "this system forbids gdb to trace a program";
  }

  // What gdb answers to each `print`, in their order, where the program has stopped.
  static std::vector<std::string> answers(const std::vector<std::string>& commands) {
    std::vector<std::string> all = {"break ValuesForGdb.cpp:stop", "run", "up"};
    all.insert(all.end(), commands.begin(), commands.end());
    const auto gdb = gdbAfter(all);
    EXPECT_EQ(gdb->exitStatus(), 0) << gdb->error();

    std::vector<std::string> found;
    std::istringstream output(gdb->output());
    for (std::string line; std::getline(output, line);) {
      // Each answer has a number: $1 = ...
      if (line.starts_with('$')) found.push_back(line.substr(line.find('=') + 2));
    }
    EXPECT_FALSE(found.empty()) << gdb->output() << gdb->error();
    return found;
  }

 private:
  // gdb on the program of values, which has run these commands and has ended.
  static std::unique_ptr<Process> gdbAfter(const std::vector<std::string>& commands) {
    std::vector<std::string> arguments = {"-nx", "-batch",
                                          "-x",  VARNEL_SOURCE_DIR "/tools/gdb/printers.py",
                                          "-ex", "set startup-with-shell off"};
    for (const std::string& command : commands) arguments.insert(arguments.end(), {"-ex", command});
    arguments.push_back(VARNEL_VALUES_FOR_GDB);
    auto gdb = std::make_unique<Process>(
        tool("gdb"), arguments,
        std::vector<std::string>{"LC_ALL=C.UTF-8", "PYTHONHOME", "PYTHONPATH", "DEBUGINFOD_URLS"});
    EXPECT_TRUE(gdb->waitForEnd());
    return gdb;
  }

  // As in containers that allow no ptrace. gdb ends with status 0 there, too.
  static inline bool isTracingForbidden = false;
};

TEST_F(Printers, AValueShowsItsKindAndItsContent) {
  EXPECT_THAT(
      answers({"print absent", "print text", "print integer", "print real", "print truth", "print date",
               "print dateBetweenSeconds", "print data", "print noData", "print array"}),
      ElementsAre("Absent", R"(String "a \"quoted\" \\ line\nof µs\xff")", "Integer -5", "Real 0.25",
                  "Boolean true", "Date 2001-01-02 01:01:01 UTC", "Date 2000-12-31 23:59:59.000500 UTC",
                  "Data of 2 bytes: 0a b0", "Data of 0 bytes",
                  R"(Array of 2 elements = {String "first", Integer 2})"));
}

TEST_F(Printers, ADictionaryShowsItsEntriesInTheirOrder) {
  EXPECT_THAT(
      answers({"print section", "print empty"}),
      ElementsAre(
          R"(Dictionary of 4 entries = {["Serving Cell"] = Dictionary of 1 entry = {["PCI"] = String "7"}, )"
          R"(["Band"] = String "3", ["Antennas"] = String "2", ["Serving"] = String "yes"})",
          "Dictionary of 0 entries"));
}

TEST_F(Printers, APacketShowsTheFieldsOfItsHeaderAndItsBytes) {
  EXPECT_THAT(answers({"print packet", "print extra"}),
              ElementsAre("Packet of log type 1, log code 0xB179, record length 14, 15 bytes: "
                          "01 0e 00 79 b1 00 00 00 00 00 00 00 00 04 fe",
                          "Packet of log type 255, log code 0xFF0201, record length 256, 13 bytes: "
                          "ff 00 01 01 02 00 00 00 00 00 00 00 00"));
}

TEST_F(Printers, APacketWithoutAHeaderShowsItsBytes) {
  EXPECT_THAT(answers({"print record", "print nothing"}),
              ElementsAre("Packet of 3 bytes, too short for a header: 00 04 fe",
                          "Packet of 0 bytes, too short for a header"));
}

TEST_F(Printers, TheLimitOfElementsHoldsForAll) {
  // A key and a value are an element each.
  EXPECT_THAT(
      answers({"set print elements 4", "print text", "print section", "print packet"}),
      ElementsAre(
          R"(String "a \"q"...)",
          R"(Dictionary of 4 entries = {["Serv"...] = Dictionary of 1 entry = {["PCI"] = String "7"}, )"
          R"(["Band"] = String "3"...})",
          "Packet of log type 1, log code 0xB179, record length 14, 15 bytes: 01 0e 00 79 ..."));
}

TEST_F(Printers, AVariableWithoutAValueSaysSo) {
  EXPECT_THAT(answers({"set variable text._content._M_index = 200", "print text"}),
              ElementsAre("Value without a content (index 200)"));
}

}  // namespace
}  // namespace varnel
