#include "host/CaptureWriter.h"

#include "host/captures/PcapEncoders.h"

namespace varnel {

namespace {

std::unique_ptr<CaptureEncoder> encoderFor(const std::optional<std::string>& technology) {
  if (technology) return std::make_unique<PcapngWriter>(*technology);
  return std::make_unique<PcapWriter>();
}

void append(Bytes& bytes, ByteView more) { bytes.insert(bytes.end(), more.begin(), more.end()); }

}  // namespace

CaptureWriter::CaptureWriter(const std::string& path, ExistingRecording existing,
                             const std::optional<std::string>& technology)
    : _file(path, existing), _encoder(encoderFor(technology)) {}

void CaptureWriter::write(Time time, ByteView message) {
  Bytes bytes;
  // The header and the first record go out in one call: there is no file without a record.
  if (!_hasHeader) append(bytes, _encoder->beginning());
  append(bytes, _encoder->encode({.time = time, .message = message}));
  _file.append(bytes);
  _hasHeader = true;
}

}  // namespace varnel
