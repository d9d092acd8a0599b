#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "fuzz/MemoryFile.h"
#include "fuzz/Require.h"
#include "host/Capture.h"
#include "host/CaptureWriter.h"

using namespace varnel;

namespace {

struct Record {
  Time time;
  Bytes message;

  friend bool operator==(const Record&, const Record&) = default;
};

bool isOneLine(const std::string& text) { return !text.empty() && text.find('\n') == std::string::npos; }

// The records before the first that is damaged.
std::vector<Record> recordsOf(const std::string& path) {
  std::vector<Record> records;
  try {
    CaptureReader reader(path);
    for (CaptureRecord record; reader.next(record);) {
      require(record.time.nanoseconds >= 0 && record.time.nanoseconds < 1'000'000'000,
              "nanoseconds are a part");
      records.push_back({record.time, Bytes(record.message.begin(), record.message.end())});
    }
  } catch (const CaptureError& error) {
    require(isOneLine(error.what()), "an error is one line");
  }
  return records;
}

}  // namespace

// The input is a whole capture. What could be read of it can be written, and then reads the same.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static MemoryFile file;
  static MemoryFile copy;
  file.set({data, size});
  std::vector<Record> records = recordsOf(file.path());
  {
    CaptureWriter writer(copy.path());
    for (const auto& [time, message] : records) writer.write(time, message);
  }
  // A capture keeps 32 bits of the seconds.
  for (Record& record : records) record.time.seconds = static_cast<std::uint32_t>(record.time.seconds);
  std::vector<Record> copied = recordsOf(copy.path());
  for (Record& record : copied) record.time.seconds = static_cast<std::uint32_t>(record.time.seconds);
  require(copied == records, "a capture that is written again holds the same records");
  return 0;
}
