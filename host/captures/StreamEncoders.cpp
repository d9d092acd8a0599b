#include "host/captures/StreamEncoders.h"

#include "host/captures/FrameEncoding.h"
#include "host/captures/LittleEndian.h"
#include "host/captures/LogFrame.h"

namespace varnel {

namespace {

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
  _frame.clear();
  appendFramed(_frame, _contents);
  return _frame;
}

ByteView RecordStreamWriter::encode(const CaptureRecord& record) {
  _record.clear();
  return appendLogRecord(_record, record) ? ByteView(_record) : leaveOut();
}

}  // namespace varnel
