#include "programs/varnel-telephonyd/CaptureSurvey.h"

#include <gtest/gtest.h>

#include "host/CaptureWriter.h"
#include "tests/support/FakeQueue.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

class CaptureSurveyTest : public testing::Test {
 protected:
  std::string path() const { return _folder.file("walk.pcap"); }
  TemporaryFolder _folder;
  FakeQueue _queue;
};

TEST_F(CaptureSurveyTest, TellsTheLengthOnceTheCaptureIsRead) {
  {
    CaptureWriter writer(path());
    for (int i = 0; i <= 10'000; ++i) writer.write({1000 + i / 100, i % 100 * 10'000'000}, Bytes{1});
  }
  CaptureSurvey survey(_queue, path(), {}, Unasked::All);
  EXPECT_FALSE(survey.result());
  _queue.run();
  ASSERT_TRUE(survey.result());
  EXPECT_EQ(survey.result()->length, 100s);
  EXPECT_EQ(survey.result()->first, (Time{1000, 0}));
  EXPECT_EQ(survey.result()->last, (Time{1100, 0}));
}

TEST_F(CaptureSurveyTest, CountsWhatAReplayPlays) {
  {
    CaptureWriter writer(path());
    writer.write({1000, 0}, Bytes{0x81, 2, 1});
    writer.write({1004, 0}, Bytes{0x81, 1, 1});  // of the other subscription
    writer.write({1009, 0}, Bytes{0x81, 2, 1});  // a pause of 9 s counts as 5 s
    writer.write({500, 0}, Bytes{0x81, 2, 1});   // the clock was set back
    writer.write({501, 0}, Bytes{0x81, 2, 1});
    writer.write({500, 0}, Bytes{0x81, 2, 1});  // overtaken
    writer.write({502, 0}, Bytes{0x81, 2, 1});
  }
  CaptureSurvey survey(_queue, path(), {}, Unasked::First);
  survey.result();
  _queue.run();
  ASSERT_TRUE(survey.result());
  EXPECT_EQ(survey.result()->length, 7s);
  EXPECT_EQ(survey.result()->first, (Time{1000, 0}));
  EXPECT_EQ(survey.result()->last, (Time{502, 0}));
}

TEST_F(CaptureSurveyTest, NothingIsKnownOfWhatIsNoRegularFile) {
  CaptureSurvey survey(_queue, "/dev/null", {}, Unasked::All);
  survey.result();
  _queue.run();
  EXPECT_FALSE(survey.result());
  CaptureSurvey gone(_queue, path(), {}, Unasked::All);
  gone.result();
  _queue.run();
  EXPECT_FALSE(gone.result());
}

}  // namespace
}  // namespace varnel
