#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <regex>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "host/CaptureWriter.h"
#include "tests/support/Process.h"
#include "tests/support/Tool.h"

// What `cmake --install` makes of this build, in a folder that the build did not know.

namespace varnel {
namespace {

namespace fs = std::filesystem;
using testing::HasSubstr;

const std::string applicationID = "org.varnel.Varnel";
const std::vector<std::string> programs = {"varnel", "varnel-decode", "varnel-telephonyd"};

void expectSuccess(const std::string& program, const std::vector<std::string>& arguments) {
  Process process(program, arguments);
  ASSERT_TRUE(process.waitForEnd()) << program;
  EXPECT_EQ(process.exitStatus(), 0) << program << '\n' << process.output() << process.error();
}

std::string outputOf(const std::string& program, const std::vector<std::string>& arguments) {
  Process process(program, arguments);
  EXPECT_TRUE(process.waitForEnd()) << program;
  EXPECT_EQ(process.exitStatus(), 0) << process.error();
  return process.output();
}

std::set<std::string> matches(const std::string& text, const std::regex& pattern) {
  std::set<std::string> found;
  for (std::sregex_iterator match(text.begin(), text.end(), pattern), end; match != end; ++match)
    found.insert((*match)[1]);
  return found;
}

// The manual page of a program, below the folder of the installation.
std::string pageOf(const std::string& program) {
  const std::string section = program == "varnel-telephonyd" ? "8" : "1";
  return "share/man/man" + section + "/" + program + "." + section;
}

class Installation : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    _prefix = new TemporaryFolder;
    expectSuccess(VARNEL_CMAKE, {"--install", VARNEL_BUILD_DIR, "--prefix", _prefix->path()});
  }
  static void TearDownTestSuite() {
    delete _prefix;
    _prefix = nullptr;
  }

  static std::string installed(const std::string& path) { return _prefix->file(path); }

 private:
  static inline TemporaryFolder* _prefix = nullptr;
};

TEST_F(Installation, ProgramsFindTheirResourcesWhereverTheyAre) {
  const TemporaryFolder elsewhere;
  fs::copy(installed("."), elsewhere.file("moved"), fs::copy_options::recursive);
  // A packet that no decoder knows, so the display is the template.
  const std::string capture = elsewhere.file("one.pcap");
  CaptureWriter(capture).write(Time{}, Bytes{1, 12, 0, 0xFF, 0xEE, 0, 0, 0, 0, 0, 0, 0, 0});
  const std::string display = outputOf(elsewhere.file("moved/bin/varnel-decode"),
                                       {"--technology", "kalvi-lte", "--format", "paths", capture});
  EXPECT_THAT(display, HasSubstr("Serving Cell Info\n"));
}

TEST_F(Installation, EveryProgramExplainsItself) {
  for (const std::string& program : programs)
    EXPECT_THAT(outputOf(installed("bin/" + program), {"--help"}), HasSubstr("--help")) << program;
}

TEST_F(Installation, TheDesktopFileIsValid) {
  expectSuccess(tool("desktop-file-validate"),
                {installed("share/applications/" + applicationID + ".desktop")});
}

TEST_F(Installation, TheMetadataIsValid) {
  expectSuccess(tool("appstreamcli"),
                {"validate", "--no-net", installed("share/metainfo/" + applicationID + ".metainfo.xml")});
}

TEST_F(Installation, TheDesktopFileNamesAProgramAndAnIconThatAreThere) {
  const std::string entry = contentsOf(installed("share/applications/" + applicationID + ".desktop"));
  EXPECT_THAT(entry, HasSubstr("\nExec=varnel "));
  EXPECT_TRUE(fs::exists(installed("bin/varnel")));
  EXPECT_THAT(entry, HasSubstr("\nIcon=" + applicationID + "\n"));
  EXPECT_TRUE(fs::exists(installed("share/icons/hicolor/scalable/apps/" + applicationID + ".svg")));
}

TEST_F(Installation, TheDesktopOpensOurFilesWithTheViewer) {
  expectSuccess(tool("update-mime-database"), {installed("share/mime")});
  const std::string patterns = contentsOf(installed("share/mime/globs2"));
  const std::string entry = contentsOf(installed("share/applications/" + applicationID + ".desktop"));
  EXPECT_THAT(entry, HasSubstr("\nExec=varnel --ui window %f\n"));
  const auto types = matches(entry, std::regex("[=;]((?:application)/[^;\n]+)"));
  for (const auto& [pattern, type] : {std::pair("*.varnel", "application/x-varnel-snapshot"),
                                      std::pair("*.framed", "application/x-varnel-framed"),
                                      std::pair("*.pcapng", "application/x-pcapng")}) {
    EXPECT_THAT(patterns, HasSubstr(std::string(":") + type + ":" + pattern + "\n"));
    EXPECT_EQ(types.count(type), 1u) << type;
  }
  EXPECT_EQ(types.count("application/vnd.tcpdump.pcap"), 1u);
}

TEST_F(Installation, TheDissectorIsThereWithItsTableOfLogCodes) {
  EXPECT_THAT(
      contentsOf(installed("share/varnel/wireshark/varnel.lua")),
      HasSubstr("[0xB17F] = {{\"LTE\", \"Serving Cell Measurements\"}, {\"All radios\", \"Measurements\"}}"));
}

TEST_F(Installation, TheUnitsStartAProgramThatIsThereWithOptionsThatItHas) {
  const std::string help = outputOf(installed("bin/varnel-telephonyd"), {"--help"});
  const auto known = matches(help, std::regex(R"(\n  (?:-h,)?--([a-z-]+))"));
  for (const std::string kind : {"system", "user"}) {
    const std::string unit = contentsOf(installed("lib/systemd/" + kind + "/varnel-telephonyd.service"));
    EXPECT_THAT(unit, HasSubstr("\nType=notify\n")) << kind;
    EXPECT_THAT(unit, HasSubstr("\nExecStart=varnel-telephonyd ")) << kind;
    const auto used = matches(unit, std::regex("[ =]--([a-z-]+)"));
    EXPECT_FALSE(used.empty()) << kind;
    for (const std::string& option : used) EXPECT_EQ(known.count(option), 1u) << kind << ": " << option;
  }
  EXPECT_THAT(contentsOf(installed("lib/sysusers.d/varnel.conf")), HasSubstr("\nu varnel "));
}

TEST_F(Installation, ManualPagesHaveNoWarnings) {
  std::vector<std::string> pages = programs;
  pages.push_back("varnel-array");
  for (const std::string& page : pages)
    expectSuccess(tool("mandoc"), {"-T", "lint", "-W", "warning", installed(pageOf(page))});
}

TEST_F(Installation, EachManualPageHasTheOptionsOfItsProgram) {
  for (const std::string& program : programs) {
    const std::string help = outputOf(installed("bin/" + program), {"--help"});
    const std::string page = contentsOf(installed(pageOf(program)));
    EXPECT_EQ(matches(page, std::regex(R"(\n\.It Fl (?:h , )?-([a-z-]+))")),
              matches(help, std::regex(R"(\n  (?:-h,)?--([a-z-]+))")))
        << program;
  }
}

}  // namespace
}  // namespace varnel
