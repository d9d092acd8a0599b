#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "tests/support/Process.h"
#include "tests/support/Tool.h"

// What git says to commits in a repository where `./dev hooks` was run.

namespace varnel {
namespace {

namespace fs = std::filesystem;
using testing::AllOf;
using testing::HasSubstr;
using testing::Not;

class Hooks : public testing::Test {
 protected:
  struct Result {
    int status;
    std::string error;
  };

  Hooks() {
    tool("clang-format");
    for (const char* part : {".githooks", ".clang-format", "dev"})
      fs::copy(fs::path(VARNEL_SOURCE_DIR) / part, _folder.path() / part, fs::copy_options::recursive);
    EXPECT_EQ(git({"init", "--quiet"}).status, 0);
    const Result installed = run(_folder.file("dev"), {"hooks"});
    EXPECT_EQ(installed.status, 0) << installed.error;
  }

  Result git(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"-C", _folder.path()});
    return run(tool("git"), arguments);
  }

  void write(const std::string& file, const std::string& text) { std::ofstream(_folder.file(file)) << text; }

  void stage(const std::string& file, const std::string& text) {
    write(file, text);
    EXPECT_EQ(git({"add", file}).status, 0);
  }

  Result commit() { return git({"commit", "--quiet", "--message", "Tests: a change"}); }

  Result commitWithMessage(const std::string& message) {
    return git({"commit", "--quiet", "--allow-empty", "--message", message});
  }

 private:
  // Neither the machine's settings nor those of a commit that these tests run in have a say.
  static Result run(const std::string& program, const std::vector<std::string>& arguments) {
    Process process(
        program, arguments,
        {"GIT_CONFIG_GLOBAL=/dev/null", "GIT_CONFIG_NOSYSTEM=1", "GIT_DIR", "GIT_WORK_TREE", "GIT_INDEX_FILE",
         "GIT_PREFIX", "GIT_AUTHOR_NAME=Somebody", "GIT_AUTHOR_EMAIL=nobody@localhost",
         "GIT_COMMITTER_NAME=Somebody", "GIT_COMMITTER_EMAIL=nobody@localhost"});
    EXPECT_TRUE(process.waitForEnd()) << program;
    return {process.exitStatus(), process.error()};
  }

  TemporaryFolder _folder;
};

const std::string formatted = "int two() { return 2; }\n";
const std::string unformatted = "int  two( ){return 2;}\n";

TEST_F(Hooks, AFormattedFileIsTaken) {
  stage("two.cpp", formatted);
  const Result result = commit();
  EXPECT_EQ(result.status, 0) << result.error;
}

TEST_F(Hooks, FilesThatAreNotFormattedAreRefusedByTheirNames) {
  stage("good.cpp", formatted);
  stage("two words.h", unformatted);
  stage("bad.cpp", unformatted);
  const Result result = commit();
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.error,
            "pre-commit: not formatted; ./dev format does it, then add these files again:\n"
            "  bad.cpp\n"
            "  two words.h\n");
}

TEST_F(Hooks, WhatIsStagedCountsNotWhatLiesInTheFolder) {
  stage("two.cpp", formatted);
  write("two.cpp", unformatted);
  const Result taken = commit();
  EXPECT_EQ(taken.status, 0) << taken.error;

  stage("two.h", unformatted);
  write("two.h", formatted);
  EXPECT_EQ(commit().status, 1);
}

TEST_F(Hooks, OtherFilesAndRemovedOnesAreNotLookedAt) {
  stage("two.txt", unformatted);
  stage("two.cpp", unformatted);
  EXPECT_EQ(git({"commit", "--quiet", "--no-verify", "--message", "Tests: as it was"}).status, 0);
  EXPECT_EQ(git({"rm", "--quiet", "two.cpp"}).status, 0);
  stage("three.txt", unformatted);
  const Result result = commit();
  EXPECT_EQ(result.status, 0) << result.error;
}

TEST_F(Hooks, ASubjectNamesItsAreaAndHas72ColumnsAtMost) {
  for (const std::string& subject : {
           std::string("LTE: show serving cell measurements"),
           std::string("Viewer, server: --sim shows one SIM card"),
           std::string("varnel-decode: times in \xC2\xB5s; ratio 1:2"),
           "Fuzz: " + std::string(66, 'x'),
           // A letter of two bytes has one column.
           "Fuzz: \xC2\xB5" + std::string(65, 'x'),
           std::string("Docs: a subject\n\nAnd a body. It may end with a period."),
           std::string("fixup! whatever"),
           std::string("Merge branch 'words'"),
           std::string("Revert \"whatever\""),
       }) {
    const Result result = commitWithMessage(subject);
    EXPECT_EQ(result.status, 0) << subject << '\n' << result.error;
  }
}

TEST_F(Hooks, AnySubjectElseIsRefusedWithItsReason) {
  struct Case {
    std::string subject, reason;
  };
  for (const auto& [subject, reason] : {
           Case{"Fuzz: " + std::string(67, 'x'), "the subject has 73 columns; 72 are the most"},
           Case{"Docs: say more.", "the subject ends with a period"},
           Case{"Show serving cell measurements", "area before what"},
           Case{"LTE:show", "area before what"},
           Case{"LTE: ", "area before what"},
           Case{": show", "area before what"},
           Case{"Docs: one line\nand another", "an empty line is missing between subject and body"},
       }) {
    const Result result = commitWithMessage(subject);
    EXPECT_EQ(result.status, 1) << subject;
    EXPECT_THAT(result.error,
                AllOf(HasSubstr("commit-msg: "), HasSubstr(reason), Not(HasSubstr("pre-commit"))));
  }
  EXPECT_THAT(git({"commit", "--allow-empty", "--allow-empty-message", "--message", ""}).error,
              HasSubstr("commit-msg: there is no subject"));
}

}  // namespace
}  // namespace varnel
