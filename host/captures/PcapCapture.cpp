#include "host/captures/PcapCapture.h"

#include <algorithm>

#include "host/Subscription.h"
#include "host/captures/LittleEndian.h"

namespace varnel {

namespace {

constexpr std::uint32_t microsecondMagic = 0xA1B2C3D4, nanosecondMagic = 0xA1B23C4D;
constexpr std::size_t headerSize = 24, linkTypeOffset = 20, recordHeaderSize = 16;
// The upper bits describe checksums.
constexpr std::uint32_t linkTypeBits = 0xFFFF;
constexpr std::int64_t nanosecondsPerSecond = 1'000'000'000;

bool isMagic(std::uint32_t number) { return number == microsecondMagic || number == nanosecondMagic; }

struct LinkType {
  std::uint32_t number;
  const char* holds;
};

// Registered link types of pcap that people who look at phones may meet.
constexpr LinkType linkTypes[] = {
    {1, "Ethernet frames"},
    {12, "IP packets"},
    {101, "IP packets"},
    {105, "frames of a wireless network"},
    {113, "packets of a computer's network"},
    {127, "frames of a wireless network"},
    {187, "Bluetooth packets"},
    {189, "USB transfers"},
    {201, "Bluetooth packets"},
    {217, "messages of the air interface"},
    {218, "messages of a base station"},
    {220, "USB transfers"},
    {228, "IP packets"},
    {229, "IP packets"},
    {249, "USB transfers"},
    {252, "messages that another program has taken out of their frames"},
    {276, "packets of a computer's network"},
};

std::uint32_t bigEndian16(ByteView bytes, std::size_t offset) {
  return std::uint32_t{bytes[offset]} << 8 | bytes[offset + 1];
}

// Messages of the air interface travel in UDP over IPv4, to a known port.
bool holdsAirInterfaceMessages(ByteView bytes) {
  constexpr std::uint8_t version4 = 0x45, udp = 17;
  constexpr std::uint32_t port = 4729;
  constexpr std::size_t protocolOffset = 9, sourceOffset = 20, destinationOffset = 22, headers = 28;
  for (std::size_t i = 0; i + headers <= bytes.size(); ++i) {
    if (bytes[i] == version4 && bytes[i + protocolOffset] == udp &&
        (bigEndian16(bytes, i + sourceOffset) == port || bigEndian16(bytes, i + destinationOffset) == port))
      return true;
  }
  return false;
}

std::string contentsOf(std::uint32_t linkType, ByteView someBytes) {
  if (holdsAirInterfaceMessages(someBytes)) return "messages of the air interface, sent over a network";
  const auto* const known = std::ranges::find(linkTypes, linkType, &LinkType::number);
  return known == std::end(linkTypes) ? "something else" : known->holds;
}

}  // namespace

bool isPcapMagic(ByteView bytes) {
  return bytes.size() >= 4 && (isMagic(loadLittleEndian<std::uint32_t>(bytes, 0)) ||
                               isMagic(__builtin_bswap32(loadLittleEndian<std::uint32_t>(bytes, 0))));
}

std::string foreignLinkType(const std::string& name, std::uint32_t linkType, ByteView someBytes) {
  return name + " holds " + contentsOf(linkType, someBytes) + " (link type " + std::to_string(linkType) +
         "), but captures of the log channel have link type 147 (USER0); capture what the modem's diagnostic "
         "port sends";
}

void setMessage(CaptureRecord& record, ByteView message) {
  record.message = message;
  record.subscription = subscriptionOf(message);
}

std::string tooLongLine(const std::string& name, std::uint64_t number, std::uint64_t size) {
  return name + ", record " + std::to_string(number) + " is left out: its " + std::to_string(size) +
         " bytes are more than a message may have, 1 MiB";
}

PcapCapture::PcapCapture(CaptureInput input) : Capture(std::move(input)) {
  if (!bytes().holds(headerSize)) throw CaptureError(name() + " is cut off within the header of a pcap file");
  _isBigEndian = !isMagic(loadLittleEndian<std::uint32_t>(bytes().unread(), 0));
  if (number(0) == nanosecondMagic) _nanosecondsPerUnit = 1;
  const std::uint32_t foundLinkType = number(linkTypeOffset) & linkTypeBits;
  bytes().drop(headerSize);
  if (foundLinkType == linkType) return;
  bytes().holds(recordHeaderSize + 128);
  throw CaptureError(foreignLinkType(name(), foundLinkType, bytes().unread()));
}

std::uint32_t PcapCapture::number(std::size_t offset) {
  const auto found = loadLittleEndian<std::uint32_t>(bytes().unread(), offset);
  return _isBigEndian ? __builtin_bswap32(found) : found;
}

bool PcapCapture::next(CaptureRecord& record) {
  for (;;) {
    ++_recordsSeen;
    if (!bytes().holds(recordHeaderSize)) {
      if (bytes().unread().empty()) return false;
      throw CaptureError(place() + "the file is cut off within its header");
    }
    const std::uint32_t size = number(8), sizeOnTheWay = number(12);
    if (size < sizeOnTheWay)
      throw CaptureError(place() + "only " + std::to_string(size) + " of " + std::to_string(sizeOnTheWay) +
                         " bytes were captured; capture again without a snapshot length");
    const std::int64_t nanoseconds = std::int64_t{number(4)} * _nanosecondsPerUnit;
    // The file's part of a second may be more than a second.
    record.time = {std::int64_t{number(0)} + nanoseconds / nanosecondsPerSecond,
                   static_cast<std::int32_t>(nanoseconds % nanosecondsPerSecond)};
    record.dating = Dating::Known;
    const bool isTooLong = size > longestMessage;
    const bool isWhole = isTooLong ? bytes().skip(recordHeaderSize + std::uint64_t{size})
                                   : bytes().holds(recordHeaderSize + size);
    if (!isWhole)
      throw CaptureError(place() + "the file is cut off within its " + std::to_string(size) + " bytes");
    if (isTooLong) {
      ++count().tooLong;
      tell(tooLongLine(name(), _recordsSeen, size));
      continue;
    }
    setMessage(record, bytes().unread().subspan(recordHeaderSize, size));
    bytes().drop(recordHeaderSize + size);
    return true;
  }
}

}  // namespace varnel
