#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <vector>

#include "tests/support/Process.h"

namespace varnel {
namespace {

using testing::HasSubstr;

namespace fs = std::filesystem;

// The block type of a section header, with which every pcapng file begins.
constexpr const char* headerOfCaptures = "\x0A\x0D\x0D\x0A";

// Real servers that record, and real viewers that connect to them.
class RecordingEndToEnd : public testing::Test {
 protected:
  using Texts = std::vector<std::string>;

  static std::unique_ptr<Process> server(const TemporaryFolder& runtime, Texts more) {
    more.insert(more.begin(), {"--simulate", "kalvi-lte", "--runtime-dir", runtime.path()});
    return std::make_unique<Process>(VARNEL_TELEPHONYD_PROGRAM, more);
  }
  // A server started by a shell that first runs another command.
  std::unique_ptr<Process> serverAfter(const std::string& before, const std::string& after) const {
    return std::make_unique<Process>(
        "/bin/sh",
        Texts{"-c", before + "; exec " VARNEL_TELEPHONYD_PROGRAM " --simulate kalvi-lte --runtime-dir " +
                        runtime.path().string() + " --record " + record + " " + after});
  }
  std::unique_ptr<Process> viewer() const {
    return std::make_unique<Process>(VARNEL_PROGRAM, Texts{"--ui", "text", "--runtime-dir", runtime.path(),
                                                           "--device-root", device.path()});
  }
  static bool isServed(const TemporaryFolder& runtime) {
    return eventually([&] { return fs::exists(runtime.path() / "com.orvane.TelephonyServer"); });
  }
  bool recordHolds(std::size_t bytes) const {
    return eventually([&] { return contentsOf(record).size() >= bytes; });
  }
  static void end(Process& process) {
    process.signal(SIGTERM);
    EXPECT_TRUE(process.waitForEnd());
    EXPECT_EQ(process.exitStatus(), 0);
  }

  TemporaryFolder runtime, elsewhere, device, folder;
  const std::string record = folder.file("walk.pcap");
};

TEST_F(RecordingEndToEnd, AServerThatNobodyVisitsLeavesNothing) {
  const auto only = server(runtime, {"--record", record});
  ASSERT_TRUE(isServed(runtime));
  end(*only);
  EXPECT_TRUE(fs::is_empty(folder.path()));
}

TEST_F(RecordingEndToEnd, OtherServersLeaveARecordingAlone) {
  const auto first = server(runtime, {"--record", record});
  ASSERT_TRUE(isServed(runtime));
  const auto visitor = viewer();
  ASSERT_TRUE(recordHolds(100)) << first->error();

  const auto second = server(runtime, {"--record", record, "--overwrite"});
  ASSERT_TRUE(second->waitForEnd());
  EXPECT_EQ(second->exitStatus(), 1);
  const auto third = server(elsewhere, {"--record", record, "--overwrite"});
  ASSERT_TRUE(third->waitForEnd());
  EXPECT_EQ(third->exitStatus(), 1);
  EXPECT_EQ(third->error(),
            "varnel-telephonyd: another process records to " + record + "; name another file\n");

  end(*first);
  const std::string recorded = contentsOf(record);
  EXPECT_TRUE(recorded.starts_with(headerOfCaptures));
  const auto restarted = server(elsewhere, {"--record", record});
  ASSERT_TRUE(restarted->waitForEnd());
  EXPECT_EQ(restarted->exitStatus(), 1);
  EXPECT_THAT(restarted->error(), HasSubstr("--overwrite"));
  EXPECT_EQ(contentsOf(record), recorded);
}

TEST_F(RecordingEndToEnd, AFileThatGrowsTooLongEndsTheRecordingAndNotTheServing) {
  const auto only = serverAfter("ulimit -f 1", "");
  ASSERT_TRUE(isServed(runtime));
  const auto visitor = viewer();
  const std::string line =
      "varnel-telephonyd: the recording has ended: cannot record to " + record + ": File too large\n";
  EXPECT_TRUE(
      eventually([&] { return only->error().find(line) != std::string::npos; }, std::chrono::seconds(60)));
  // A later viewer is served.
  const auto later = viewer();
  EXPECT_TRUE(eventually([&] { return fs::exists(runtime.path() / "com.orvane.TelephonyServer"); }));
  end(*only);
}

TEST_F(RecordingEndToEnd, WithoutAStandardErrorLogLinesDoNotGoIntoTheRecording) {
  const auto only = serverAfter(":", "--log-level 7 0<&- 1>&- 2>&-");
  ASSERT_TRUE(isServed(runtime));
  const auto visitor = viewer();
  ASSERT_TRUE(recordHolds(100));
  end(*only);
  const std::string recorded = contentsOf(record);
  EXPECT_TRUE(recorded.starts_with(headerOfCaptures));
  EXPECT_EQ(recorded.find("A log channel"), std::string::npos);
}

}  // namespace
}  // namespace varnel
