#include "host/captures/PcapngBlocks.h"

#include <limits>

#include "host/captures/LittleEndian.h"

namespace varnel::pcapng {

namespace {

constexpr std::uint32_t sectionBlock = 0x0A0D0D0A, interfaceBlock = 1, packetBlock = 6;
constexpr std::uint32_t byteOrderMagic = 0x1A2B3C4D;
constexpr std::uint16_t endOfOptions = 0;
constexpr std::uint16_t nameOption = 2, descriptionOption = 3, resolutionOption = 9;  // of an interface
constexpr std::uint16_t commentOption = 1, flagsOption = 2;                           // of a packet
constexpr std::uint8_t nanoseconds = 9;                                               // a power of ten
constexpr std::uint32_t noLimit = 0;
constexpr std::size_t longestText = 1024;

void putPadded(Bytes& bytes, ByteView value) {
  bytes.insert(bytes.end(), value.begin(), value.end());
  bytes.resize((bytes.size() + 3) / 4 * 4);
}

void putOption(Bytes& bytes, std::uint16_t kind, ByteView value) {
  appendLittleEndian(bytes, kind, static_cast<std::uint16_t>(value.size()));
  putPadded(bytes, value);
}

void putOption(Bytes& bytes, std::uint16_t kind, std::string_view text) {
  text = text.substr(0, longestText);
  putOption(bytes, kind, {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()});
}

// A block has its size at the beginning and at the end.
void putBlock(Bytes& bytes, std::uint32_t type, const Bytes& body) {
  const auto size = static_cast<std::uint32_t>(body.size() + 12);
  appendLittleEndian(bytes, type, size);
  bytes.insert(bytes.end(), body.begin(), body.end());
  appendLittleEndian(bytes, size);
}

std::uint64_t nanosecondsSince1970(Time time) {
  constexpr std::uint64_t perSecond = 1'000'000'000, most = std::numeric_limits<std::uint64_t>::max();
  if (time.seconds < 0) return 0;
  const auto seconds = static_cast<std::uint64_t>(time.seconds);
  return seconds >= most / perSecond ? most
                                     : seconds * perSecond + static_cast<std::uint64_t>(time.nanoseconds);
}

}  // namespace

void appendSection(Bytes& file) {
  Bytes section;
  appendLittleEndian(section, byteOrderMagic, std::uint16_t{1}, std::uint16_t{0}, ~std::uint64_t{0});
  putBlock(file, sectionBlock, section);
}

void appendInterface(Bytes& file, const Interface& interface) {
  Bytes body;
  appendLittleEndian(body, interface.linkType, std::uint16_t{0}, noLimit);
  if (interface.name) putOption(body, nameOption, *interface.name);
  if (interface.description) putOption(body, descriptionOption, *interface.description);
  putOption(body, resolutionOption, Bytes{nanoseconds});
  putOption(body, endOfOptions, ByteView());
  putBlock(file, interfaceBlock, body);
}

void appendPacket(Bytes& file, const Packet& packet) {
  const auto size = static_cast<std::uint32_t>(packet.bytes.size());
  const std::uint64_t time = nanosecondsSince1970(packet.time);
  const bool hasDirection = packet.direction != Direction::Unknown;
  Bytes body;
  appendLittleEndian(body, packet.interface, static_cast<std::uint32_t>(time >> 32),
                     static_cast<std::uint32_t>(time), size, size);
  putPadded(body, packet.bytes);
  if (!packet.comment.empty()) putOption(body, commentOption, packet.comment);
  if (hasDirection) {
    Bytes flags;
    appendLittleEndian(flags, std::uint32_t{static_cast<std::uint8_t>(packet.direction)});
    putOption(body, flagsOption, flags);
  }
  if (hasDirection || !packet.comment.empty()) putOption(body, endOfOptions, ByteView());
  putBlock(file, packetBlock, body);
}

}  // namespace varnel::pcapng
