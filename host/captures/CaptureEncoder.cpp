#include "host/captures/CaptureEncoder.h"

#include <cstring>
#include <limits>

#include "base/MessagePrefix.h"
#include "host/captures/LittleEndian.h"
#include "host/captures/LogFrame.h"
#include "host/captures/ModemTime.h"

namespace varnel {

namespace {

constexpr std::uint8_t packetLogType = 1;
constexpr std::size_t logTypeSize = 1, timeOffset = 4;
constexpr std::size_t longestRecord = std::numeric_limits<std::uint16_t>::max();

ModemTime timeToWrite(ModemTime inHeader, const CaptureRecord& record) {
  const bool isModems = datingOf(inHeader) == Dating::Known || timeOf(inHeader) == record.time;
  return isModems ? inHeader : modemTimeOf(record.time);
}

template <class Number>
void store(Bytes& bytes, std::size_t offset, Number number) {
  std::memcpy(bytes.data() + offset, &number, sizeof number);
}

}  // namespace

std::optional<std::string> CaptureEncoder::remark(const std::string& captureName,
                                                  const std::string& path) const {
  if (_leftOut == 0) return std::nullopt;
  return std::to_string(_leftOut) + (_leftOut == 1 ? " message of " : " messages of ") + captureName +
         " did not come from a modem as log records (of log type 1), so " + path + " is without " +
         (_leftOut == 1 ? "it" : "them");
}

bool appendLogRecord(Bytes& bytes, const CaptureRecord& record) {
  ByteView found = record.message;
  if (found.size() > prefixSize && found[0] == prefixMark) found = found.subspan(prefixSize);
  if (found.empty() || found[0] != packetLogType) return false;
  found = found.subspan(logTypeSize);
  if (found.size() < smallestRecord || found.size() > longestRecord) return false;

  const std::size_t begin = bytes.size();
  bytes.insert(bytes.end(), found.begin(), found.end());
  store(bytes, begin, static_cast<std::uint16_t>(found.size()));
  const ModemTime inHeader{loadLittleEndian<std::uint64_t>(found, timeOffset)};
  store(bytes, begin + timeOffset, timeToWrite(inHeader, record).raw);
  return true;
}

}  // namespace varnel
