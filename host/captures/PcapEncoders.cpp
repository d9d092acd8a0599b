#include "host/captures/PcapEncoders.h"

#include "host/captures/LittleEndian.h"
#include "host/captures/PcapCapture.h"
#include "host/captures/PcapngBlocks.h"

namespace varnel {

namespace {

constexpr std::uint32_t nanosecondMagic = 0xA1B23C4D;

}  // namespace

ByteView PcapWriter::beginning() {
  constexpr std::uint32_t snapshotLength = PcapCapture::longestMessage;
  _bytes.clear();
  appendLittleEndian(_bytes, nanosecondMagic, std::uint16_t{2}, std::uint16_t{4}, std::uint64_t{0},
                     snapshotLength, PcapCapture::linkType);
  return _bytes;
}

ByteView PcapWriter::encode(const CaptureRecord& record) {
  const auto size = static_cast<std::uint32_t>(record.message.size());
  _bytes.clear();
  appendLittleEndian(_bytes, static_cast<std::uint32_t>(record.time.seconds),
                     static_cast<std::uint32_t>(record.time.nanoseconds), size, size);
  _bytes.insert(_bytes.end(), record.message.begin(), record.message.end());
  return _bytes;
}

ByteView PcapngWriter::beginning() {
  _bytes.clear();
  pcapng::appendSection(_bytes);
  pcapng::appendInterface(_bytes, {.linkType = PcapCapture::linkType, .description = _technology});
  return _bytes;
}

ByteView PcapngWriter::encode(const CaptureRecord& record) {
  _bytes.clear();
  pcapng::appendPacket(_bytes, {.interface = 0, .time = record.time, .bytes = record.message});
  return _bytes;
}

}  // namespace varnel
