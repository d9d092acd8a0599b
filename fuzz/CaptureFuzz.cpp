#include <sys/mman.h>
#include <unistd.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "fuzz/Require.h"
#include "platform/host/Capture.h"

using namespace varnel;

namespace {

// A file that stands in memory alone.
class MemoryFile {
 public:
  MemoryFile() : _descriptor(memfd_create("capture", MFD_CLOEXEC)) {
    require(_descriptor >= 0, "memory file");
  }
  MemoryFile(const MemoryFile&) = delete;
  MemoryFile& operator=(const MemoryFile&) = delete;
  ~MemoryFile() { close(_descriptor); }

  std::string path() const { return "/proc/self/fd/" + std::to_string(_descriptor); }
  void set(ByteView bytes) {
    require(ftruncate(_descriptor, 0) == 0, "memory file can be emptied");
    const ssize_t written = pwrite(_descriptor, bytes.data(), bytes.size(), 0);
    require(written == static_cast<ssize_t>(bytes.size()), "memory file can be written");
  }

 private:
  int _descriptor;
};

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
