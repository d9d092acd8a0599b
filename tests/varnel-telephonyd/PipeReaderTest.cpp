#include "programs/varnel-telephonyd/PipeReader.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <cerrno>
#include <string>

#include "host/FileDescriptor.h"
#include "host/captures/CaptureRecord.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

const std::string pcapHeader("\x4D\x3C\xB2\xA1\x02\0\x04\0\0\0\0\0\0\0\0\0\0\0\x04\0\x93\0\0\0", 24);

// A record of one byte.
std::string recordOf(char second, char byte) {
  return std::string{second, 0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0, byte};
}

class PipeReaderTest : public testing::Test {
 protected:
  PipeReaderTest() {
    int ends[2];
    if (::pipe2(ends, O_CLOEXEC) != 0) ADD_FAILURE() << "no pipe";
    _out = FileDescriptor(ends[0]);
    _in = FileDescriptor(ends[1]);
  }
  void write(const std::string& bytes) const {
    EXPECT_EQ(::write(_in.number(), bytes.data(), bytes.size()), static_cast<ssize_t>(bytes.size()));
  }
  void closeWriter() { _in = FileDescriptor(); }
  int bytesInPipe() const {
    int count = -1;
    EXPECT_EQ(::ioctl(_out.number(), FIONREAD, &count), 0);
    return count;
  }
  static RecordReading taken(PipeReader& reader) {
    std::optional<RecordReading> reading;
    EXPECT_TRUE(eventually([&] { return (reading = reader.take()).has_value(); }));
    return reading.value_or(RecordReading{});
  }
  static RecordReading read(PipeReader& reader) {
    reader.request();
    return taken(reader);
  }

  FileDescriptor _out, _in;
};

TEST_F(PipeReaderTest, ARecordIsThereBeforeTheWriterGoesOn) {
  PipeReader reader(_out.number(), "the pipe");
  reader.start([] {});
  reader.request();
  write(pcapHeader + recordOf(5, 7));
  const RecordReading first = taken(reader);
  EXPECT_EQ(first.message, Bytes{7});
  EXPECT_EQ(first.time, (Time{5, 0}));
  write(recordOf(6, 8));
  EXPECT_EQ(read(reader).message, Bytes{8});
  closeWriter();
  const RecordReading end = read(reader);
  EXPECT_TRUE(end.isEnd);
  EXPECT_EQ(end.error, "");
}

TEST_F(PipeReaderTest, KnowsWhetherARecordWasThereAlready) {
  PipeReader reader(_out.number(), "the pipe");
  reader.start([] {});
  write(pcapHeader + recordOf(5, 7) + recordOf(6, 8));
  EXPECT_FALSE(read(reader).wasAwaited);
  EXPECT_FALSE(read(reader).wasAwaited);
  // Nothing tells whether the thread already waits when the record is written. So there are several tries.
  EXPECT_TRUE(eventually([&] {
    reader.request();
    std::this_thread::sleep_for(std::chrono::milliseconds(10));
    write(recordOf(7, 9));
    return taken(reader).wasAwaited;
  }));
}

TEST_F(PipeReaderTest, ReadsNothingThatIsNotRequested) {
  PipeReader reader(_out.number(), "the pipe");
  EXPECT_FALSE(reader.isReadable());
  reader.start([] {});
  write(pcapHeader + recordOf(5, 7));
  EXPECT_TRUE(reader.isReadable());
  EXPECT_EQ(read(reader).message, Bytes{7});
  write(recordOf(6, 8));
  EXPECT_EQ(bytesInPipe(), 17);
  EXPECT_EQ(read(reader).message, Bytes{8});
  EXPECT_EQ(bytesInPipe(), 0);
}

TEST_F(PipeReaderTest, AskingForTheTechnologyLosesNoRecord) {
  PipeReader reader(_out.number(), "the pipe");
  write(pcapHeader + recordOf(5, 7));
  EXPECT_EQ(reader.technology(), std::nullopt);
  reader.start([] {});
  EXPECT_EQ(read(reader).message, Bytes{7});
}

TEST_F(PipeReaderTest, WhatIsNoCaptureIsSaidAsOfAFile) {
  write("GIF89a");
  closeWriter();
  PipeReader early(_out.number(), "the pipe");
  EXPECT_THROW(early.technology(), CaptureError);
  PipeReader reader(_out.number(), "the pipe");
  reader.start([] {});
  const RecordReading reading = read(reader);
  EXPECT_TRUE(reading.isEnd);
  EXPECT_EQ(reading.error, "the pipe is empty, and so no capture");
}

TEST_F(PipeReaderTest, ARecordThatIsCutOffIsSaid) {
  write(pcapHeader + recordOf(5, 7).substr(0, 10));
  closeWriter();
  PipeReader reader(_out.number(), "the pipe");
  reader.start([] {});
  const RecordReading reading = read(reader);
  EXPECT_TRUE(reading.isEnd);
  EXPECT_NE(reading.error.find("the file is cut off within its header"), std::string::npos) << reading.error;
}

TEST_F(PipeReaderTest, StopsWhileItWaits) {
  PipeReader reader(_out.number(), "the pipe");
  reader.start([] {});
  reader.request();
}

}  // namespace
}  // namespace varnel
