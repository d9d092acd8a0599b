#pragma once

#include <gmock/gmock.h>

#include <algorithm>
#include <cstdint>
#include <fstream>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/captures/Capture.h"
#include "tests/support/Process.h"

namespace varnel {

/// A record that stays valid after the next one was read.
struct KeptRecord {
  Time time;
  Bytes message;
  Dating dating = Dating::Known;
  std::optional<std::uint8_t> subscription = {};

  friend bool operator==(const KeptRecord&, const KeptRecord&) = default;
  friend void PrintTo(const KeptRecord& record, std::ostream* output) {
    *output << record.time.seconds << '.' << record.time.nanoseconds
            << (record.dating == Dating::Known ? "" : " undated");
    if (record.subscription) *output << " of " << int{*record.subscription};
    *output << ' ' << testing::PrintToString(record.message);
  }
};

struct CaptureReading {
  std::vector<KeptRecord> records;
  LeftOut leftOut{};
  std::optional<std::string> technology{};
  std::optional<std::string> error{};
  std::vector<std::string> told{};
};

/// Bytes in memory.
class MemorySource final : public ByteSource {
 public:
  explicit MemorySource(const Bytes& bytes) : _bytes(bytes) {}
  std::size_t read(std::span<std::uint8_t> room) override {
    const std::size_t count = std::min(room.size(), _bytes.size() - _read);
    std::copy_n(_bytes.begin() + static_cast<std::ptrdiff_t>(_read), count, room.begin());
    _read += count;
    return count;
  }
  std::uint64_t bytesRead() const override { return _read; }
  std::optional<std::uint64_t> fileSize() const override { return _bytes.size(); }

 private:
  const Bytes& _bytes;
  std::size_t _read = 0;
};

inline KeptRecord kept(const CaptureRecord& record) {
  return {record.time, Bytes(record.message.begin(), record.message.end()), record.dating,
          record.subscription};
}

inline void appendAll(CaptureReading& reading, Capture& capture) {
  for (CaptureRecord record; capture.next(record);) reading.records.push_back(kept(record));
}

inline CaptureReading readSource(const std::function<std::unique_ptr<ByteSource>()>& open,
                                 const std::string& name) {
  CaptureReading reading;
  std::unique_ptr<Capture> capture;
  try {
    capture = openCapture({.bytes = ByteWindow(open()), .name = name, .tell = [&](const std::string& line) {
                             reading.told.push_back(line);
                           }});
    reading.technology = capture->technology();
    appendAll(reading, *capture);
  } catch (const CaptureError& error) {
    reading.error = error.what();
  }
  if (capture) reading.leftOut = capture->leftOut();
  return reading;
}

inline CaptureReading readCapture(const std::string& path) {
  return readSource([&] { return openFile(path, AtEndOfFile::Stop); }, path);
}

inline CaptureReading readMemory(const Bytes& bytes) {
  return readSource([&] { return std::make_unique<MemorySource>(bytes); }, "memory");
}

inline Bytes joined(const std::vector<Bytes>& parts) {
  Bytes whole;
  for (const Bytes& part : parts) whole.insert(whole.end(), part.begin(), part.end());
  return whole;
}

inline Bytes firstOf(const Bytes& bytes, std::size_t count) {
  return {bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(count)};
}

/// A folder for the files of a test.
class CaptureFiles : public testing::Test {
 protected:
  std::string path(const std::string& name = "capture") const { return _folder.file(name); }

  CaptureReading readBytes(const Bytes& bytes) const {
    std::ofstream file(path(), std::ios::binary);
    file.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
    file.close();
    return readCapture(path());
  }

 private:
  TemporaryFolder _folder;
};

/// Bytes worked out by hand: two log records, alone and inside frames and wrappers.
namespace example {

/// Code 0xB17F at 2024-03-01 14:05:09.500625: units 1,114,669,687,600 of 1.25 ms and 24,576 parts.
inline const Bytes dated{0x10, 0x00, 0x7F, 0xB1, 0x00, 0x60, 0x30, 0xA3,
                         0x7D, 0x87, 0x03, 0x01, 0x7E, 0x7D, 0x05, 0xFF};
inline const Bytes datedFrame{0x10, 0x00, 0x10, 0x00, 0x10, 0x00, 0x7F, 0xB1, 0x00, 0x60, 0x30, 0xA3, 0x7D,
                              0x5D, 0x87, 0x03, 0x01, 0x7D, 0x5E, 0x7D, 0x5D, 0x05, 0xFF, 0xCF, 0x91, 0x7E};
/// Code 0xB0C1, two seconds after the modem's start.
inline const Bytes undated{0x0D, 0x00, 0xC1, 0xB0, 0x00, 0x00, 0x40, 0x06, 0x00, 0x00, 0x00, 0x00, 0x2A};
/// In the wrapper for the second subscription.
inline const Bytes undatedFrame{0x98, 0x01, 0x00, 0x00, 0x02, 0x00, 0x00, 0x00, 0x10, 0x00,
                                0x0D, 0x00, 0x0D, 0x00, 0xC1, 0xB0, 0x00, 0x00, 0x40, 0x06,
                                0x00, 0x00, 0x00, 0x00, 0x2A, 0x83, 0x80, 0x7E};
inline const Bytes answerFrame{0x00, 0x61, 0x62, 0x63, 0x37, 0xA4, 0x7E};
inline const Bytes debugFrame{0x92, 0x01, 0x02, 0xC7, 0xC0, 0x7E};
inline const Bytes encryptedFrame{0x9E, 0x01, 0x02, 0x03, 0xA4, 0xE7, 0x7E};

/// Its record claims to be four bytes longer than the frame. Its checksum is right.
inline const Bytes brokenFrame{0x10, 0x00, 0x10, 0x00, 0x14, 0x00, 0x7F, 0xB1, 0x00, 0x60, 0x30, 0xA3, 0x7D,
                               0x5D, 0x87, 0x03, 0x01, 0x7D, 0x5E, 0x7D, 0x5D, 0x05, 0xFF, 0xAD, 0xB9, 0x7E};

inline const Time datedTime{1709301909, 500625000};
inline const Time undatedTime{315964802, 0};

inline Bytes message(const Bytes& record) { return joined({{0x01}, record}); }
inline const KeptRecord datedRecord{datedTime, message(dated)};
inline const KeptRecord undatedRecord{undatedTime, message(undated), Dating::Unknown};
// In a binary log, this time would be a server's count of milliseconds: 104,857.6 s.
inline const Time countedTime{316069657, 600000000};
inline const KeptRecord undatedRecordOfTwo{undatedTime, joined({{0x81, 0x02, 0x01}, undated}),
                                           Dating::Unknown, 2};

/// A frame with a length.
inline Bytes lengthFrame(const Bytes& contents) {
  return joined({{0x7E, 0x01, static_cast<std::uint8_t>(contents.size()),
                  static_cast<std::uint8_t>(contents.size() >> 8)},
                 contents,
                 {0x7E}});
}
inline const Bytes datedContents = joined({{0x10, 0x00, 0x10, 0x00}, dated});
inline const Bytes undatedContents =
    joined({{0x98, 0x01, 0x00, 0x00, 0x02, 0x00, 0x00, 0x00, 0x10, 0x00, 0x0D, 0x00}, undated});

/// The version report of a binary log.
inline Bytes versionReport() {
  Bytes report(161);
  const std::string name = "EXECUTABLE_NAME";
  report[0] = 161;
  report[2] = 0xFD;
  report[3] = 0x1F;
  report[12] = report[14] = 1;
  std::copy(name.begin(), name.end(), report.begin() + 23);
  return report;
}

/// The checksum of a frame, bit by bit.
inline std::uint16_t slowChecksum(const Bytes& contents) {
  unsigned rest = 0xFFFF;
  for (const std::uint8_t byte : contents) {
    rest ^= byte;
    for (int bit = 0; bit < 8; ++bit) rest = rest & 1 ? rest >> 1 ^ 0x8408 : rest >> 1;
  }
  return static_cast<std::uint16_t>(~rest);
}

/// A frame of a framed stream.
inline Bytes frame(Bytes contents) {
  const std::uint16_t checksum = slowChecksum(contents);
  contents.insert(contents.end(),
                  {static_cast<std::uint8_t>(checksum), static_cast<std::uint8_t>(checksum >> 8)});
  Bytes escaped;
  for (const std::uint8_t byte : contents) {
    if (byte == 0x7E || byte == 0x7D) escaped.insert(escaped.end(), {0x7D});
    escaped.push_back(byte == 0x7E || byte == 0x7D ? byte ^ 0x20 : byte);
  }
  escaped.push_back(0x7E);
  return escaped;
}

}  // namespace example

}  // namespace varnel
