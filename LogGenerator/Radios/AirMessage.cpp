#include "LogGenerator/Radios/AirMessage.h"

#include <algorithm>
#include <array>
#include <iterator>
#include <utility>

#include "LogGenerator/Radios/Messages/MessageChoice.h"
#include "LogGenerator/Radios/Messages/NASNames.h"
#include "LogGenerator/Radios/Messages/RRCChannels.h"

namespace varnel {

namespace {

using Radio = AirMessage::Radio;
using Protocol = AirMessage::Protocol;
using Direction = AirMessage::Direction;
using enum MessageFate::Outcome;

constexpr std::uint32_t lteRRCCode = 0xB0C0, nrRRCCode = 0xB821;
constexpr std::uint32_t umtsRRCCode = 0x412F;
constexpr std::uint32_t gsmRRCode = 0x512F, gsmRROfSubscriptionCode = 0x5B2F;
constexpr std::uint32_t circuitNASCode = 0x713A, circuitNASOfSubscriptionCode = 0x7B3A;

// The NAS packets of LTE and NR: the even codes are incoming.
struct NASCode {
  std::uint32_t logCode;
  Radio radio;
  Direction direction;
};
constexpr NASCode nasCodes[] = {
    {0xB0E0, Radio::LTE, Direction::Downlink}, {0xB0E1, Radio::LTE, Direction::Uplink},
    {0xB0E2, Radio::LTE, Direction::Downlink}, {0xB0E3, Radio::LTE, Direction::Uplink},
    {0xB0EA, Radio::LTE, Direction::Downlink}, {0xB0EB, Radio::LTE, Direction::Uplink},
    {0xB0EC, Radio::LTE, Direction::Downlink}, {0xB0ED, Radio::LTE, Direction::Uplink},
    {0xB800, Radio::NR, Direction::Downlink},  {0xB801, Radio::NR, Direction::Uplink},
    {0xB808, Radio::NR, Direction::Downlink},  {0xB809, Radio::NR, Direction::Uplink},
    {0xB80A, Radio::NR, Direction::Downlink},  {0xB80B, Radio::NR, Direction::Uplink},
    {0xB814, Radio::NR, Direction::Unknown},  // a message in a container of another
};

constexpr std::size_t otherCodes = 7;
constexpr auto logCodes = [] {
  std::array<std::uint32_t, std::size(nasCodes) + otherCodes> codes{lteRRCCode,
                                                                    nrRRCCode,
                                                                    umtsRRCCode,
                                                                    gsmRRCode,
                                                                    gsmRROfSubscriptionCode,
                                                                    circuitNASCode,
                                                                    circuitNASOfSubscriptionCode};
  for (std::size_t i = 0; i < std::size(nasCodes); ++i) codes[otherCodes + i] = nasCodes[i].logCode;
  return codes;
}();

// What a packet says about its message. The name is made only for those who want it.
struct Found {
  MessageFate fate;
  std::optional<PacketVersion> version{};
  AirMessage message{};
  const MessageChannel* channel = nullptr;  // of RRC messages; null when the number is not known
  unsigned number = 0;                      // the packet's number of the channel
  unsigned segment = 0;                     // 0: the message is whole
  std::uint8_t type = 0;                    // of RR messages
};

Found tooShort(std::uint32_t logCode, std::optional<PacketVersion> version = std::nullopt) {
  return {.fate = {TooShort, logCode}, .version = version};
}

Found unknown(std::uint32_t logCode, PacketVersion version) {
  return {.fate = {UnknownVersion, logCode, version}, .version = version};
}

// The bytes behind the header, when there are as many as the packet says.
bool takeBytes(Found& found, const Packet& payload, std::size_t header, std::size_t length) {
  if (length == 0 || payload.size() <= header || payload.size() - header != length) return false;
  found.message.bytes = payload.bytes().subspan(header);
  return true;
}

// The header of RRC packets of some versions. Offsets count from the payload's first byte.
struct RRCHeader {
  std::uint8_t firstVersion, lastVersion;
  std::uint8_t size, cell, channel, channelSize, frame, number, length;
  std::uint8_t segment;  // 0: messages are always whole
};

// In the order of the members.
constexpr RRCHeader lteHeaders[] = {
    {2, 4, 13, 4, 6, 2, 8, 10, 11, 0},    {5, 7, 17, 4, 6, 2, 8, 10, 15, 0},
    {8, 24, 19, 4, 6, 4, 10, 12, 17, 0},  {25, 27, 21, 6, 8, 4, 12, 14, 19, 0},
    {29, 29, 21, 6, 8, 4, 12, 14, 19, 0}, {30, 31, 24, 6, 8, 4, 12, 14, 19, 23},
};

constexpr RRCHeader nrHeaders[] = {
    {7, 9, 24, 7, 9, 4, 13, 17, 22, 0},     {12, 12, 23, 7, 9, 4, 13, 16, 21, 0},
    {14, 14, 23, 7, 9, 4, 13, 16, 21, 0},   {17, 17, 31, 7, 17, 4, 21, 24, 29, 0},
    {19, 20, 32, 7, 17, 4, 21, 24, 29, 0},  {23, 24, 35, 7, 17, 4, 21, 24, 29, 34},
    {25, 25, 32, 7, 17, 4, 21, 24, 29, 0},  {26, 26, 35, 7, 17, 4, 21, 24, 29, 34},
    {28, 28, 35, 7, 17, 4, 21, 24, 29, 34},
};

template <std::size_t size>
const RRCHeader* headerOf(const RRCHeader (&headers)[size], std::uint32_t version) {
  const auto* const found = std::ranges::find_if(headers, [&](const RRCHeader& header) {
    return header.firstVersion <= version && version <= header.lastVersion;
  });
  return found == std::end(headers) ? nullptr : found;
}

// What the headers of all versions have in common. False when the length does not agree.
bool takeHeader(Found& found, const Packet& payload, const RRCHeader& header) {
  if (!takeBytes(found, payload, header.size, payload.u16(header.length))) return false;
  found.message.physicalCell = payload.u16(header.cell);
  found.message.channelNumber =
      header.channelSize == 2 ? payload.u16(header.channel) : payload.u32(header.channel);
  found.number = payload.u8(header.number);
  if (header.segment != 0) found.segment = payload.u8(header.segment);
  return true;
}

void takeChannel(Found& found, const MessageChannel* channel) {
  found.channel = channel;
  if (!channel) return;
  found.message.channel = channel->name;
  found.message.direction = channel->direction;
}

Found findLTERRC(const Packet& payload) {
  if (payload.size() == 0) return tooShort(lteRRCCode);
  const PacketVersion version{payload.u8(0)};
  const RRCHeader* const header = headerOf(lteHeaders, version.number);
  if (!header) return unknown(lteRRCCode, version);
  Found found{.fate = {Decoded, lteRRCCode}, .version = version, .message = {.radio = Radio::LTE}};
  if (!takeHeader(found, payload, *header)) return tooShort(lteRRCCode, version);
  // A word of 0 says that the frame is not known. Of the two bits above the frame number the meaning is not.
  if (payload.u16(header->frame) != 0) {
    found.message.subframe = static_cast<std::uint8_t>(payload.bits(header->frame, 0, 4));
    found.message.frame = static_cast<std::uint16_t>(payload.bits(header->frame, 4, 10));
  }
  takeChannel(found, lteRRCChannel(version.number, found.number));
  return found;
}

Found findNRRRC(const Packet& payload) {
  if (payload.size() < 4) return tooShort(nrRRCCode);
  const PacketVersion version{payload.u32(0)};
  const RRCHeader* const header = headerOf(nrHeaders, version.number);
  if (!header) return unknown(nrRRCCode, version);
  Found found{.fate = {Decoded, nrRRCCode}, .version = version, .message = {.radio = Radio::NR}};
  if (!takeHeader(found, payload, *header)) return tooShort(nrRRCCode, version);
  // Until the phone has added an NR cell both are 0. Cell 0 by itself is a cell.
  if (found.message.physicalCell == 0 && found.message.channelNumber == 0U) {
    found.message.physicalCell.reset();
    found.message.channelNumber.reset();
  }
  // Later versions pack the frame in another way, which is not known.
  constexpr std::uint32_t lastWithFrame = 9;
  if (version.number <= lastWithFrame && payload.u32(header->frame) != 0) {
    found.message.subframe = static_cast<std::uint8_t>(payload.bits(header->frame, 3, 4));
    found.message.frame = static_cast<std::uint16_t>(payload.bits(header->frame, 16, 10));
  }
  takeChannel(found, nrRRCChannel(version.number, found.number));
  return found;
}

Found findUMTSRRC(const Packet& payload) {
  constexpr std::size_t headerSize = 4, cellSize = 4;
  constexpr unsigned withCell = 0x80;
  Found found{.fate = {Decoded, umtsRRCCode}, .message = {.radio = Radio::UMTS}};
  const unsigned number = payload.u8(0);
  const std::size_t length = payload.u16(2);
  const bool isBlock = number == 9 || number == 0xFE || number == 0xFF;
  const bool isBlockOfCell = number == (9 | withCell) || number == 0xF0;
  const bool hasCell = isBlockOfCell || (number >= withCell && !isBlock);
  const std::size_t header = headerSize + (hasCell ? cellSize : 0) + (isBlockOfCell ? 1 : 0);
  // The length counts either what follows it or the message alone.
  if (!payload.holds(0, headerSize)) return tooShort(umtsRRCCode);
  if (length != payload.size() - headerSize && length + header != payload.size())
    return tooShort(umtsRRCCode);
  const std::size_t first = isBlock ? headerSize + 1 : header;
  if (payload.size() <= first) return tooShort(umtsRRCCode);
  found.message.bytes = payload.bytes().subspan(first);
  if (hasCell) {
    found.message.channelNumber = payload.u16(headerSize);
    found.message.physicalCell = payload.u16(headerSize + 2);
  }
  if (isBlock || isBlockOfCell) {
    takeChannel(found, umtsSystemInformationBlock(payload.u8(first - 1), isBlock ? BlockNumbers::WithoutCell
                                                                                 : BlockNumbers::WithCell));
    found.message.direction = Direction::Downlink;
  } else {
    takeChannel(found, umtsRRCChannel(number & (withCell - 1)));
  }
  return found;
}

// One of the codes has the subscription in front.
Packet withoutSubscription(const Packet& payload, bool hasSubscription) {
  return hasSubscription ? payload.from(1) : payload;
}

Found findGSMRR(const Packet& payload, std::uint32_t logCode) {
  constexpr std::size_t headerSize = 3;
  constexpr std::string_view channels[] = {"DCCH", "BCCH", "RACH", "CCCH", "SACCH", "SDCCH", "FACCH"};
  enum { BCCH = 1, CCCH = 3, SACCH = 4 };
  constexpr std::uint8_t rr = 6;  // the protocol discriminator
  Found found{.fate = {Decoded, logCode}, .message = {.radio = Radio::GSM, .protocol = Protocol::RR}};
  AirMessage& message = found.message;
  if (!takeBytes(found, payload, headerSize, payload.u8(2))) return tooShort(logCode);
  const unsigned channel = payload.u8(0) & 0x7FU;
  if (channel < std::size(channels)) message.channel = channels[channel];
  message.direction = payload.u8(0) >> 7 != 0 ? Direction::Downlink : Direction::Uplink;
  found.type = payload.u8(1);
  const Packet octets(message.bytes);
  // System information on the SACCH has a pseudo length, other messages there have none.
  if (channel == BCCH || channel == CCCH ||
      (channel == SACCH && octets.u8(1) == rr && octets.u8(2) == found.type && (octets.u8(0) & 0xF) != rr)) {
    message.layer2Octets = 1;
  }
  return found;
}

Found findCircuitNAS(const Packet& payload, std::uint32_t logCode) {
  constexpr std::size_t headerSize = 5;
  Found found{.fate = {Decoded, logCode}, .message = {.radio = Radio::GSM, .protocol = Protocol::NAS}};
  if (!takeBytes(found, payload, headerSize, payload.u32(1))) return tooShort(logCode);
  if (payload.u8(0) <= 1)
    found.message.direction = payload.u8(0) == 0 ? Direction::Downlink : Direction::Uplink;
  return found;
}

Found findNAS(const Packet& payload, const NASCode& code) {
  constexpr std::size_t releaseSize = 3;
  constexpr std::uint32_t onlyVersion = 1;
  const std::size_t versionSize = code.radio == Radio::LTE ? 1 : 4, header = versionSize + releaseSize;
  if (payload.size() < versionSize) return tooShort(code.logCode);
  const PacketVersion version{versionSize == 1 ? payload.u8(0) : payload.u32(0)};
  if (version.number != onlyVersion) return unknown(code.logCode, version);
  if (payload.size() <= header) return tooShort(code.logCode, version);
  return {.fate = {Decoded, code.logCode},
          .version = version,
          .message = {.radio = code.radio,
                      .protocol = Protocol::NAS,
                      .direction = code.direction,
                      .bytes = payload.bytes().subspan(header)}};
}

Found find(const Packet& packet, std::uint32_t logCode) {
  const Packet payload(packet.payload());
  switch (logCode) {
    case lteRRCCode:
      return findLTERRC(payload);
    case nrRRCCode:
      return findNRRRC(payload);
    case umtsRRCCode:
      return findUMTSRRC(payload);
    case gsmRRCode:
    case gsmRROfSubscriptionCode:
      return findGSMRR(withoutSubscription(payload, logCode == gsmRROfSubscriptionCode), logCode);
    case circuitNASCode:
    case circuitNASOfSubscriptionCode:
      return findCircuitNAS(withoutSubscription(payload, logCode == circuitNASOfSubscriptionCode), logCode);
    default:
      break;
  }
  const auto* const nas = std::ranges::find(nasCodes, logCode, &NASCode::logCode);
  if (nas == std::end(nasCodes)) return {.fate = {Unknown, logCode}};
  return findNAS(payload, *nas);
}

// A message with a protocol discriminator that is not of EPS (TS 24.007 11.2.3.1.1) may begin with ciphered
// octets, but not under the codes of plain messages.
std::string_view epsNASNameIn(ByteView message, std::uint32_t logCode) {
  constexpr std::uint32_t plainCodes[] = {0xB0E2, 0xB0E3, 0xB0EC, 0xB0ED};
  constexpr unsigned session = 2, mobility = 7;
  const unsigned discriminator = Packet(message).u8(0) & 0xFU;
  if (discriminator != session && discriminator != mobility &&
      std::ranges::find(plainCodes, logCode) != std::end(plainCodes))
    return unknownMessage;
  return epsNASName(message);
}

std::string_view nameIn(const Found& found, std::uint32_t logCode) {
  const AirMessage& message = found.message;
  if (message.protocol == Protocol::RRC)
    return found.channel ? messageName(*found.channel, message.bytes) : unknownMessage;
  constexpr std::string_view randomAccess = "RACH";  // its messages have no type
  if (message.protocol == Protocol::RR)
    return message.channel == randomAccess ? "Channel Request" : gsmRRName(found.type);
  if (logCode == circuitNASCode || logCode == circuitNASOfSubscriptionCode)
    return circuitNASName(message.bytes);
  return message.radio == Radio::LTE ? epsNASNameIn(message.bytes, logCode) : fiveGNASName(message.bytes);
}

}  // namespace

std::span<const std::uint32_t> airMessageLogCodes() { return logCodes; }

MessageFate AirMessageReader::fateOf(const Packet& packet, std::uint32_t logCode) {
  return find(packet, logCode).fate;
}

AirMessageReading AirMessageReader::read(const Packet& packet, std::uint32_t logCode) {
  Found found = find(packet, logCode);
  AirMessageReading reading{.fate = found.fate, .version = found.version};
  if (found.fate.outcome != Decoded) return reading;
  const unsigned version = found.version ? found.version->number : 0;
  if (found.segment != 0 &&
      !join(found.message, found.segment, {.logCode = logCode, .version = version, .channel = found.number}))
    return reading;
  AirMessage& message = found.message;
  if (logCode == circuitNASCode || logCode == circuitNASOfSubscriptionCode) {
    message.radio = _circuitRadio;
  } else if (message.radio == Radio::UMTS || message.radio == Radio::GSM) {
    _circuitRadio = message.radio;
  }
  message.name = nameIn(found, logCode);
  reading.message = message;
  return reading;
}

// True when the message is whole now. Its bytes are then those of all parts.
bool AirMessageReader::join(AirMessage& message, unsigned segment, const Parts& key) {
  constexpr unsigned lastOfMessage = 7;
  auto parts = std::ranges::find(_parts, key.logCode, &Parts::logCode);
  if (parts == _parts.end()) parts = _parts.insert(parts, key);
  if (segment == 1) {
    parts->version = key.version;
    parts->channel = key.channel;
    parts->bytes.clear();
  }
  const bool isNext = segment == 1 || (parts->lastSegment != 0 && parts->version == key.version &&
                                       parts->channel == key.channel &&
                                       (segment == lastOfMessage || segment == parts->lastSegment + 1));
  if (!isNext || segment > lastOfMessage || message.bytes.size() > longestJoined - parts->bytes.size()) {
    parts->lastSegment = 0;
    parts->bytes.clear();
    return false;
  }
  parts->bytes.insert(parts->bytes.end(), message.bytes.begin(), message.bytes.end());
  parts->lastSegment = segment;
  if (segment != lastOfMessage) return false;
  _joined.swap(parts->bytes);
  parts->bytes.clear();
  parts->lastSegment = 0;
  message.bytes = _joined;
  return true;
}

std::string_view nameOf(AirMessage::Radio radio) {
  constexpr std::string_view names[] = {"LTE", "NR", "UMTS", "GSM"};
  return names[static_cast<std::size_t>(radio)];
}

std::string_view nameOf(AirMessage::Protocol protocol) {
  constexpr std::string_view names[] = {"RRC", "NAS", "RR"};
  return names[static_cast<std::size_t>(protocol)];
}

std::string_view nameOf(AirMessage::Direction direction) {
  constexpr std::string_view names[] = {"", "Downlink", "Uplink"};
  return names[static_cast<std::size_t>(direction)];
}

std::string_view channelNumberName(AirMessage::Radio radio) {
  constexpr std::string_view names[] = {"EARFCN", "NR-ARFCN", "UARFCN", "ARFCN"};
  return names[static_cast<std::size_t>(radio)];
}

}  // namespace varnel
