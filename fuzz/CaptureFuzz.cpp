#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "fuzz/MemoryFile.h"
#include "fuzz/Require.h"
#include "host/captures/Capture.h"
#include "host/captures/PcapEncoders.h"
#include "host/captures/StreamEncoders.h"

using namespace varnel;

namespace {

struct Record {
  Time time;
  Dating dating;
  std::optional<std::uint8_t> subscription;
  Bytes message;

  CaptureRecord view() const { return {time, dating, message, subscription}; }
  friend bool operator==(const Record&, const Record&) = default;
};

bool isOneLine(const std::string& text) { return !text.empty() && text.find('\n') == std::string::npos; }

// The records before the first damaged one.
std::vector<Record> recordsOf(const std::string& path) {
  std::vector<Record> records;
  try {
    const auto capture = openCapture(path);
    for (CaptureRecord record; capture->next(record);) {
      require(record.time.nanoseconds >= 0 && record.time.nanoseconds < 1'000'000'000,
              "nanoseconds are a part");
      records.push_back({record.time, record.dating, record.subscription,
                         Bytes(record.message.begin(), record.message.end())});
    }
  } catch (const CaptureError& error) {
    require(isOneLine(error.what()), "an error is one line");
  }
  return records;
}

// The bytes, and how many of the records they hold.
struct Encoded {
  Bytes bytes;
  std::size_t records;
};

Encoded encoded(CaptureEncoder& encoder, const std::vector<Record>& records) {
  const ByteView beginning = encoder.beginning();
  Bytes bytes(beginning.begin(), beginning.end());
  for (const Record& record : records) {
    const ByteView more = encoder.encode(record.view());
    bytes.insert(bytes.end(), more.begin(), more.end());
  }
  return {bytes, records.size() - encoder.leftOut()};
}

void checkPcap(std::vector<Record> records, MemoryFile& copy) {
  PcapWriter writer;
  copy.set(encoded(writer, records).bytes);
  // A capture keeps 32 bits of the seconds, and records of pcap have a date.
  for (Record& record : records) {
    record.time.seconds = static_cast<std::uint32_t>(record.time.seconds);
    record.dating = Dating::Known;
  }
  require(recordsOf(copy.path()) == records, "a capture that is written again holds the same records");
}

void checkFrames(const std::vector<Record>& records, MemoryFile& copy) {
  FramedWriter first, second;
  const Encoded frames = encoded(first, records);
  // The reader searches the first 64 KiB for the first frame.
  constexpr std::size_t longest = 16'000;
  for (const Record& record : records) {
    if (record.message.size() > longest) return;
  }
  copy.set(frames.bytes);
  const std::vector<Record> read = recordsOf(copy.path());
  require(read.size() == frames.records, "all frames that are written are read");
  require(encoded(second, read).bytes == frames.bytes, "frames are written as they were read");
}

}  // namespace

// The input is a whole capture of any kind. The records that were read can be written, and read again without
// a change.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static MemoryFile file;
  static MemoryFile copy;
  file.set({data, size});
  const std::vector<Record> records = recordsOf(file.path());
  checkPcap(records, copy);
  checkFrames(records, copy);
  return 0;
}
