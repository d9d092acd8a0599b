#include "host/captures/StreamEncoders.h"

#include "host/captures/FrameChecksum.h"
#include "host/captures/LittleEndian.h"
#include "host/captures/LogFrame.h"

namespace varnel {

namespace {

constexpr std::uint8_t frameEnd = 0x7E, escape = 0x7D, escapeBit = 0x20;

void appendEscaped(Bytes& frame, ByteView bytes) {
  for (const std::uint8_t byte : bytes) {
    const bool isSpecial = byte == frameEnd || byte == escape;
    if (isSpecial) frame.push_back(escape);
    frame.push_back(isSpecial ? byte ^ escapeBit : byte);
  }
}

void appendSubscription(Bytes& contents, std::uint8_t subscription) {
  contents.insert(contents.end(), {frameCommand::ofSubscription, 1, 0, 0});
  appendLittleEndian(contents, std::uint32_t{subscription});
}

}  // namespace

ByteView FramedWriter::encode(const CaptureRecord& record) {
  Bytes log;
  if (!appendLogRecord(log, record)) return leaveOut();
  const auto length = static_cast<std::uint16_t>(log.size());
  _contents.clear();
  if (record.subscription) appendSubscription(_contents, *record.subscription);
  _contents.insert(_contents.end(), {frameCommand::log, 0});
  appendLittleEndian(_contents, length);
  _contents.insert(_contents.end(), log.begin(), log.end());
  appendLittleEndian(_contents, frameChecksum(_contents));
  _frame.clear();
  appendEscaped(_frame, _contents);
  _frame.push_back(frameEnd);
  return _frame;
}

ByteView RecordStreamWriter::encode(const CaptureRecord& record) {
  _record.clear();
  return appendLogRecord(_record, record) ? ByteView(_record) : leaveOut();
}

}  // namespace varnel
