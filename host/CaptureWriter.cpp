#include "host/CaptureWriter.h"

#include <cstdint>
#include <limits>

namespace varnel {

namespace {

constexpr std::uint32_t nanosecondMagic = 0xA1B23C4D;
constexpr std::uint32_t version2_4 = 4U << 16U | 2U;
constexpr std::uint32_t logChannelLinkType = 147;
// Log messages may be long: nothing is cut.
constexpr std::uint32_t snapshotLength = std::numeric_limits<std::int32_t>::max();

void append(Bytes& bytes, std::uint32_t word) {
  for (int shift = 0; shift < 32; shift += 8) bytes.push_back(static_cast<std::uint8_t>(word >> shift));
}

void appendHeader(Bytes& bytes) {
  for (const std::uint32_t word : {nanosecondMagic, version2_4, 0U, 0U, snapshotLength, logChannelLinkType})
    append(bytes, word);
}

void appendRecord(Bytes& bytes, Time time, ByteView message) {
  append(bytes, static_cast<std::uint32_t>(time.seconds));
  append(bytes, static_cast<std::uint32_t>(time.nanoseconds));
  append(bytes, static_cast<std::uint32_t>(message.size()));  // in the file
  append(bytes, static_cast<std::uint32_t>(message.size()));  // as it was captured
  bytes.insert(bytes.end(), message.begin(), message.end());
}

}  // namespace

void CaptureWriter::write(Time time, ByteView message) {
  Bytes bytes;
  // Both at once: there is no file without a record.
  if (!_hasHeader) appendHeader(bytes);
  appendRecord(bytes, time, message);
  _file.append(bytes);
  _hasHeader = true;
}

}  // namespace varnel
