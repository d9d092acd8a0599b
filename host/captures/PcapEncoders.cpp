#include "host/captures/PcapEncoders.h"

#include <algorithm>
#include <limits>

#include "host/captures/LittleEndian.h"
#include "host/captures/PcapCapture.h"

namespace varnel {

namespace {

constexpr std::uint32_t nanosecondMagic = 0xA1B23C4D, sectionBlock = 0x0A0D0D0A, byteOrderMagic = 0x1A2B3C4D;
constexpr std::uint32_t interfaceBlock = 1, packetBlock = 6;
constexpr std::uint16_t descriptionOption = 3, resolutionOption = 9, endOfOptions = 0;
constexpr std::uint8_t nanoseconds = 9;  // a power of ten
constexpr std::uint32_t noLimit = 0;
constexpr std::size_t longestDescription = 1024;

template <class... Numbers>
void put(Bytes& bytes, Numbers... numbers) {
  (appendLittleEndian(bytes, numbers), ...);
}

void pad(Bytes& bytes) { bytes.resize((bytes.size() + 3) / 4 * 4); }

void putOption(Bytes& bytes, std::uint16_t kind, ByteView value) {
  put(bytes, kind, static_cast<std::uint16_t>(value.size()));
  bytes.insert(bytes.end(), value.begin(), value.end());
  pad(bytes);
}

// A block has its size at the beginning and at the end.
void putBlock(Bytes& bytes, std::uint32_t type, const Bytes& body) {
  const auto size = static_cast<std::uint32_t>(body.size() + 12);
  put(bytes, type, size);
  bytes.insert(bytes.end(), body.begin(), body.end());
  put(bytes, size);
}

std::uint64_t nanosecondsSince1970(Time time) {
  constexpr std::uint64_t perSecond = 1'000'000'000, most = std::numeric_limits<std::uint64_t>::max();
  if (time.seconds < 0) return 0;
  const auto seconds = static_cast<std::uint64_t>(time.seconds);
  return seconds >= most / perSecond ? most
                                     : seconds * perSecond + static_cast<std::uint64_t>(time.nanoseconds);
}

}  // namespace

ByteView PcapWriter::beginning() {
  constexpr std::uint32_t snapshotLength = PcapCapture::longestMessage;
  _bytes.clear();
  put(_bytes, nanosecondMagic, std::uint16_t{2}, std::uint16_t{4}, std::uint64_t{0}, snapshotLength,
      PcapCapture::linkType);
  return _bytes;
}

ByteView PcapWriter::encode(const CaptureRecord& record) {
  const auto size = static_cast<std::uint32_t>(record.message.size());
  _bytes.clear();
  put(_bytes, static_cast<std::uint32_t>(record.time.seconds),
      static_cast<std::uint32_t>(record.time.nanoseconds), size, size);
  _bytes.insert(_bytes.end(), record.message.begin(), record.message.end());
  return _bytes;
}

ByteView PcapngWriter::beginning() {
  Bytes section;
  put(section, byteOrderMagic, std::uint16_t{1}, std::uint16_t{0}, ~std::uint64_t{0});
  Bytes interface;
  put(interface, static_cast<std::uint16_t>(PcapCapture::linkType), std::uint16_t{0}, noLimit);
  const std::string_view technology = std::string_view(_technology).substr(0, longestDescription);
  putOption(interface, descriptionOption,
            {reinterpret_cast<const std::uint8_t*>(technology.data()), technology.size()});
  putOption(interface, resolutionOption, Bytes{nanoseconds});
  putOption(interface, endOfOptions, {});
  _bytes.clear();
  putBlock(_bytes, sectionBlock, section);
  putBlock(_bytes, interfaceBlock, interface);
  return _bytes;
}

ByteView PcapngWriter::encode(const CaptureRecord& record) {
  const auto size = static_cast<std::uint32_t>(record.message.size());
  const std::uint64_t time = nanosecondsSince1970(record.time);
  Bytes packet;
  put(packet, std::uint32_t{0}, static_cast<std::uint32_t>(time >> 32), static_cast<std::uint32_t>(time),
      size, size);
  packet.insert(packet.end(), record.message.begin(), record.message.end());
  pad(packet);
  _bytes.clear();
  putBlock(_bytes, packetBlock, packet);
  return _bytes;
}

}  // namespace varnel
