#include "programs/varnel-telephonyd/Recorder.h"

#include <gtest/gtest.h>

#include <fstream>
#include <string>
#include <utility>
#include <vector>

#include "host/captures/Capture.h"
#include "tests/support/FileSizeLimit.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

class RecorderTest : public testing::Test {
 protected:
  std::unique_ptr<Recorder> recorder(ExistingRecording existing = ExistingRecording::Refused) {
    return std::make_unique<Recorder>(
        Recorder::Setup{.path = path,
                        .existing = existing,
                        .now = [this] { return now; },
                        .uptime = [this] { return uptime; },
                        .ended = [this](const std::string& why) { ends.push_back(why); }});
  }
  std::vector<std::pair<Time, Bytes>> recorded() const {
    std::vector<std::pair<Time, Bytes>> records;
    const auto reader = openCapture(path);
    for (CaptureRecord record; reader->next(record);)
      records.emplace_back(record.time, Bytes(record.message.begin(), record.message.end()));
    return records;
  }

  TemporaryFolder folder;
  const std::string path = folder.file("walk.pcap");
  Time now{1709301909, 900'000'000};
  std::chrono::nanoseconds uptime = 5s;
  std::vector<std::string> ends;
};

TEST_F(RecorderTest, TimeIsThatOfTheFirstMessageAndWhatHasPassedSince) {
  const auto recording = recorder();
  now = {1709301910, 900'000'000};  // the viewer comes a second later
  uptime = 6s;
  recording->record(Bytes{1});
  uptime += 200ms;
  recording->record(Bytes{2});
  now = {5, 0};  // the clock is set back by years
  uptime += 1s;
  recording->record(Bytes{3});
  EXPECT_EQ(recorded(), (std::vector<std::pair<Time, Bytes>>{{{1709301910, 900'000'000}, {1}},
                                                             {{1709301911, 100'000'000}, {2}},
                                                             {{1709301912, 100'000'000}, {3}}}));
  EXPECT_TRUE(ends.empty());
}

TEST_F(RecorderTest, AFailureEndsTheRecordingWithOneSentenceAndKeepsWhatWasWritten) {
  const auto recording = recorder();
  {
    const FileSizeLimit limit(200);
    recording->record(Bytes(50, 1));
    recording->record(Bytes(50, 2));
    recording->record(Bytes(50, 3));
  }
  recording->record(Bytes(50, 4));
  EXPECT_EQ(ends, (std::vector<std::string>{"the recording has ended: cannot record to " + path +
                                            ": File too large"}));
  EXPECT_EQ(recorded(), (std::vector<std::pair<Time, Bytes>>{{now, Bytes(50, 1)}, {now, Bytes(50, 2)}}));
}

TEST_F(RecorderTest, WithoutAMessageThereIsNoFile) {
  recorder();
  EXPECT_TRUE(std::filesystem::is_empty(folder.path()));
}

TEST_F(RecorderTest, AnEarlierRecordingIsRefusedOrReplacedWithTheFirstMessage) {
  std::ofstream(path) << "last night's";
  EXPECT_THROW(recorder(), std::runtime_error);
  const auto recording = recorder(ExistingRecording::Replaced);
  EXPECT_EQ(contentsOf(path), "last night's");
  recording->record(Bytes{1});
  EXPECT_EQ(recorded(), (std::vector<std::pair<Time, Bytes>>{{now, {1}}}));
}

}  // namespace
}  // namespace varnel
