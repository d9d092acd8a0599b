#include "host/captures/PcapngCapture.h"

#include <algorithm>
#include <limits>

#include "host/captures/LittleEndian.h"
#include "host/captures/PcapCapture.h"

namespace varnel {

namespace {

namespace blockType {
constexpr std::uint32_t section = 0x0A0D0D0A, interface = 1, oldPacket = 2, simplePacket = 3, packet = 6;
}

namespace option {
constexpr std::uint16_t end = 0, description = 3, resolution = 9, timeOffset = 14;
}

constexpr std::uint32_t byteOrderMagic = 0x1A2B3C4D;
constexpr std::size_t blockHeader = 8, blockTrailer = 4;
// The longest block with a description that is read. Longer ones hold nothing that is needed.
constexpr std::size_t longestDescription = 1 << 16;
constexpr std::size_t mostInterfaces = 4096;
constexpr std::uint8_t isPowerOfTwo = 0x80;
constexpr std::uint64_t nanosecondsPerSecond = 1'000'000'000;

std::size_t padded(std::size_t size) { return (size + 3) / 4 * 4; }

// Parts of a second in nanoseconds. There are fewer parts than `partsPerSecond`, which is a power of ten or
// of two.
std::uint64_t nanosecondsOf(std::uint64_t parts, std::uint64_t partsPerSecond) {
  if (partsPerSecond % nanosecondsPerSecond == 0) return parts / (partsPerSecond / nanosecondsPerSecond);
  constexpr std::uint64_t finest = std::uint64_t{1} << 32;
  if (partsPerSecond <= finest) return parts * nanosecondsPerSecond / partsPerSecond;
  return parts / (partsPerSecond / finest) * nanosecondsPerSecond / finest;
}

}  // namespace

bool isPcapngMagic(ByteView bytes) {
  return bytes.size() >= 4 && loadLittleEndian<std::uint32_t>(bytes, 0) == blockType::section;
}

PcapngCapture::PcapngCapture(CaptureInput input) : Capture(std::move(input)) {
  while (_interfaces.empty()) {
    const auto block = nextBlock();
    if (!block) throw CaptureError(name() + " is a pcapng file without the description of an interface");
    if (block->type == blockType::interface) {
      addInterface(*block);
    } else if (block->type == blockType::packet || block->type == blockType::oldPacket ||
               block->type == blockType::simplePacket) {
      failAsDamaged();
    } else if (block->type != blockType::section) {
      passOver(*block);
    }
  }
  const Interface& first = _interfaces.front();
  if (!first.description.empty()) _technology = first.description;
  if (first.linkType == PcapCapture::linkType) return;
  bytes().holds(blockHeader + 160);
  throw CaptureError(foreignLinkType(name(), first.linkType, bytes().unread()));
}

bool PcapngCapture::next(CaptureRecord& record) {
  while (const auto block = nextBlock()) {
    switch (block->type) {
      case blockType::section:
        break;
      case blockType::interface:
        addInterface(*block);
        break;
      case blockType::packet:
      case blockType::oldPacket:
      case blockType::simplePacket:
        if (takePacket(*block, record)) return true;
        break;
      default:
        passOver(*block);
    }
  }
  return false;
}

// The header of the next block, which is still unread; nothing at the end. Handles the header of a section
// itself.
std::optional<PcapngCapture::Block> PcapngCapture::nextBlock() {
  if (!bytes().holds(blockHeader)) {
    if (bytes().unread().empty()) return std::nullopt;
    failAsCutOff();
  }
  if (u32(0) == blockType::section) {
    startSection();
    return Block{blockType::section, 0};
  }
  const Block block{u32(0), u32(4)};
  if (block.size < blockHeader + blockTrailer || block.size % 4 != 0) failAsDamaged();
  return block;
}

void PcapngCapture::startSection() {
  constexpr std::size_t smallestSection = 28;
  if (!bytes().holds(smallestSection)) failAsCutOff();
  _isBigEndian = loadLittleEndian<std::uint32_t>(bytes().unread(), blockHeader) != byteOrderMagic;
  if (u32(blockHeader) != byteOrderMagic) failAsDamaged();
  const Block block{blockType::section, u32(4)};
  if (block.size < smallestSection || block.size % 4 != 0) failAsDamaged();
  _interfaces.clear();
  passOver(block);
}

void PcapngCapture::addInterface(const Block& block) {
  constexpr std::size_t optionsOffset = 16;
  if (block.size < optionsOffset + blockTrailer || _interfaces.size() >= mostInterfaces) failAsDamaged();
  if (!bytes().holds(std::min<std::size_t>(block.size, longestDescription))) failAsCutOff();
  Interface interface { .linkType = u16(8), .snapshotLength = u32(12) };
  if (block.size <= longestDescription) readOptions(interface, optionsOffset, block.size - blockTrailer);
  passOver(block);
  _interfaces.push_back(std::move(interface));
}

void PcapngCapture::readOptions(Interface& interface, std::size_t begin, std::size_t end) {
  constexpr std::size_t optionHeader = 4;
  while (end - begin >= optionHeader) {
    const std::uint16_t kind = u16(begin);
    const std::size_t size = u16(begin + 2);
    begin += optionHeader;
    if (kind == option::end || size > end - begin) return;
    if (kind == option::description) {
      const auto text = bytes().unread().subspan(begin, size);
      interface.description.assign(text.begin(), text.end());
    }
    if (kind == option::resolution && size >= 1) interface.resolution = bytes().unread()[begin];
    if (kind == option::timeOffset && size >= 8) {
      const std::uint64_t first = u32(begin), second = u32(begin + 4);
      interface.offset_s =
          static_cast<std::int64_t>(_isBigEndian ? first << 32 | second : second << 32 | first);
    }
    begin += std::min(padded(size), end - begin);
  }
}

bool PcapngCapture::takePacket(const Block& block, CaptureRecord& record) {
  const auto packet = packetIn(block);
  if (!packet) failAsDamaged();
  if (_interfaces[packet->interfaceNumber].linkType != PcapCapture::linkType) {
    ++count().otherCommands;
    passOver(block);
    return false;
  }
  ++_recordsSeen;
  if (packet->size < packet->sizeOnTheWay)
    throw CaptureError(name() + ", record " + std::to_string(_recordsSeen) + ": only " +
                       std::to_string(packet->size) + " of " + std::to_string(packet->sizeOnTheWay) +
                       " bytes were captured; capture again without a snapshot length");
  if (packet->size > PcapCapture::longestMessage) {
    passOver(block);
    ++count().tooLong;
    tell(tooLongLine(name(), _recordsSeen, packet->size));
    return false;
  }
  const std::size_t whole = packet->offset + packet->size;
  if (!bytes().holds(whole)) failAsCutOff();
  if (packet->time) _lastTime = *packet->time;
  record.time = _lastTime;
  record.dating = packet->time ? Dating::Known : Dating::Unknown;
  // After the message there are rarely more than four bytes, but there can be any number.
  if (block.size - whole > longestDescription) failAsDamaged();
  if (!bytes().holds(block.size)) failAsCutOff();
  if (u32(block.size - blockTrailer) != block.size) failAsDamaged();
  setMessage(record, bytes().unread().subspan(packet->offset, packet->size));
  bytes().drop(block.size);
  return true;
}

// The place of the message in a packet's block; nothing when the block contradicts itself.
std::optional<PcapngCapture::PacketPlace> PcapngCapture::packetIn(const Block& block) {
  const bool isSimple = block.type == blockType::simplePacket;
  const std::size_t offset = isSimple ? 12 : 28;
  if (block.size < offset + blockTrailer) return std::nullopt;
  if (!bytes().holds(offset)) failAsCutOff();
  const auto room = static_cast<std::uint32_t>(block.size - offset - blockTrailer);
  PacketPlace packet{.interfaceNumber = 0, .offset = offset, .size = 0, .sizeOnTheWay = 0, .time = {}};
  if (isSimple) {
    packet.size = packet.sizeOnTheWay = u32(8);
    const std::uint32_t most = _interfaces.empty() ? 0 : _interfaces.front().snapshotLength;
    if (most > 0) packet.size = std::min(packet.size, most);
  } else {
    packet.interfaceNumber = block.type == blockType::packet ? u32(8) : u16(8);
    packet.size = u32(20);
    packet.sizeOnTheWay = u32(24);
  }
  if (packet.interfaceNumber >= _interfaces.size() || packet.size > room) return std::nullopt;
  if (!isSimple) packet.time = timeAt(_interfaces[packet.interfaceNumber], 12);
  return packet;
}

Time PcapngCapture::timeAt(const Interface& interface, std::size_t offset) {
  constexpr unsigned mostTens = 19, mostTwos = 63;
  const std::uint64_t parts = std::uint64_t{u32(offset)} << 32 | u32(offset + 4);
  const unsigned power = interface.resolution & (isPowerOfTwo - 1U);
  const bool isOfTwo = (interface.resolution & isPowerOfTwo) != 0;
  if (power > (isOfTwo ? mostTwos : mostTens)) failAsDamaged();
  std::uint64_t partsPerSecond = 1;
  for (unsigned i = 0; i < power; ++i) partsPerSecond *= isOfTwo ? 2 : 10;
  const std::uint64_t seconds = parts / partsPerSecond + static_cast<std::uint64_t>(interface.offset_s);
  return {static_cast<std::int64_t>(seconds),
          static_cast<std::int32_t>(nanosecondsOf(parts % partsPerSecond, partsPerSecond))};
}

// Skips the block, which has its size again at its end.
void PcapngCapture::passOver(const Block& block) {
  if (!bytes().skip(block.size - blockTrailer) || !bytes().holds(blockTrailer)) failAsCutOff();
  if (u32(0) != block.size) failAsDamaged();
  bytes().drop(blockTrailer);
}

void PcapngCapture::failAsDamaged() const {
  throw CaptureError(name() + " is damaged: a block behind record " + std::to_string(_recordsSeen) +
                     " contradicts itself");
}

void PcapngCapture::failAsCutOff() const {
  throw CaptureError(name() + " is cut off within a block behind record " + std::to_string(_recordsSeen));
}

std::uint16_t PcapngCapture::u16(std::size_t offset) {
  const auto found = loadLittleEndian<std::uint16_t>(bytes().unread(), offset);
  return _isBigEndian ? __builtin_bswap16(found) : found;
}

std::uint32_t PcapngCapture::u32(std::size_t offset) {
  const auto found = loadLittleEndian<std::uint32_t>(bytes().unread(), offset);
  return _isBigEndian ? __builtin_bswap32(found) : found;
}

}  // namespace varnel
