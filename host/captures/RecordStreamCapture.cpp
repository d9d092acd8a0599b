#include "host/captures/RecordStreamCapture.h"

#include "host/captures/LittleEndian.h"
#include "host/captures/LogFrame.h"

namespace varnel {

namespace {

constexpr std::uint8_t packetLogType = 1;

}  // namespace

bool RecordStreamCapture::next(CaptureRecord& record) {
  std::size_t length = 0;
  if (bytes().holds(2)) {
    length = loadLittleEndian<std::uint16_t>(bytes().unread(), 0);
    if (length < smallestRecord) {
      ++count().broken;
      leaveOutTheRest();
      return false;
    }
  }
  if (length == 0 || !bytes().holds(length)) {
    if (!bytes().unread().empty()) ++count().torn;
    bytes().drop(bytes().unread().size());
    return false;
  }
  takeLogRecord(bytes().unread().first(length), packetLogType, record);
  bytes().drop(length);
  return true;
}

void RecordStreamCapture::leaveOutTheRest() {
  do {
    const std::size_t rest = bytes().unread().size();
    count().noiseBytes += rest;
    bytes().drop(rest);
  } while (bytes().more());
}

}  // namespace varnel
