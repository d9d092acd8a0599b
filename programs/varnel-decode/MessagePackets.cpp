#include "programs/varnel-decode/MessagePackets.h"

#include <limits>

#include "programs/varnel-decode/MessageDissectors.h"

namespace varnel {

namespace {

using Radio = AirMessage::Radio;
using Direction = AirMessage::Direction;

constexpr std::uint16_t upperPduLinkType = 252, ipv4LinkType = 228;

// Both forms are big-endian.
void putU16(Bytes& bytes, std::size_t number) {
  bytes.push_back(static_cast<std::uint8_t>(number >> 8));
  bytes.push_back(static_cast<std::uint8_t>(number));
}

void putU32(Bytes& bytes, std::uint32_t number) {
  putU16(bytes, number >> 16);
  putU16(bytes, number);
}

void append(Bytes& bytes, ByteView more) { bytes.insert(bytes.end(), more.begin(), more.end()); }

// Puts the bits 0 0001 before the message, which make it the second of the messages of UL-DCCH (TS 38.331
// 6.2.1).
Bytes asMessageOfUplinkDCCH(ByteView complete) {
  unsigned kept = 0b00001;
  Bytes message;
  for (const std::uint8_t byte : complete) {
    kept = kept << 8 | byte;
    message.push_back(static_cast<std::uint8_t>(kept >> 5));
  }
  message.push_back(static_cast<std::uint8_t>(kept << 3));
  return message;
}

bool isBareComplete(const AirMessage& message) {
  return message.radio == Radio::NR && message.channel.empty() &&
         message.name == "RRCReconfigurationComplete";
}

Bytes upperPdu(const AirMessage& message, const MessageDissector& dissector) {
  constexpr std::uint16_t nameTag = 12, directionTag = 35, endTag = 0;
  constexpr std::uint32_t sent = 0, received = 1;
  Bytes packet;
  const std::size_t nameLength = (dissector.name.size() + 3) / 4 * 4;
  putU16(packet, nameTag);
  putU16(packet, nameLength);
  packet.insert(packet.end(), dissector.name.begin(), dissector.name.end());
  packet.resize(packet.size() + nameLength - dissector.name.size());
  if (message.direction != Direction::Unknown) {
    putU16(packet, directionTag);
    putU16(packet, sizeof received);
    putU32(packet, message.direction == Direction::Downlink ? received : sent);
  }
  putU16(packet, endTag);
  putU16(packet, 0);
  if (isBareComplete(message))
    append(packet, asMessageOfUplinkDCCH(message.bytes));
  else
    append(packet, message.bytes);
  return packet;
}

// The channel field has 14 bits.
std::uint16_t gsmtapChannel(const AirMessage& message) {
  constexpr std::uint32_t most = 0x3FFF, none = 0;
  constexpr std::uint16_t uplink = 0x4000;
  const std::uint32_t number = message.channelNumber.value_or(none);
  return static_cast<std::uint16_t>((number > most ? none : number) |
                                    (message.direction == Direction::Uplink ? uplink : 0));
}

// RFC 1071, of a header whose checksum is 0.
std::uint16_t headerChecksum(ByteView header) {
  std::uint32_t sum = 0;
  for (std::size_t i = 0; i < header.size(); i += 2) sum += header[i] << 8 | header[i + 1];
  while (sum > 0xFFFF) sum = (sum & 0xFFFF) + (sum >> 16);
  return static_cast<std::uint16_t>(~sum);
}

void putIPv4Header(Bytes& packet, std::size_t length) {
  constexpr std::uint8_t wordsOfHeader = 5, timeToLive = 64, udp = 17;
  constexpr std::uint32_t thisHost = 0x7F000001;
  constexpr std::size_t checksumOffset = 10;
  packet = {0x40 | wordsOfHeader, 0};
  putU16(packet, length);
  putU32(packet, 0);  // not a fragment
  packet.insert(packet.end(), {timeToLive, udp, 0, 0});
  putU32(packet, thisHost);
  putU32(packet, thisHost);
  const std::uint16_t checksum = headerChecksum(packet);
  packet[checksumOffset] = static_cast<std::uint8_t>(checksum >> 8);
  packet[checksumOffset + 1] = static_cast<std::uint8_t>(checksum);
}

std::optional<Bytes> gsmtapPacket(const AirMessage& message, const MessageDissector& dissector) {
  constexpr std::uint8_t version = 2, wordsOfHeader = 4, timeSlot = 0;
  constexpr std::size_t ipv4Size = 20, udpSize = 8, gsmtapSize = 16, port = 4729, noChecksum = 0;
  constexpr std::size_t longest = std::numeric_limits<std::uint16_t>::max() - ipv4Size - udpSize - gsmtapSize;
  if (!dissector.gsmtapType) return std::nullopt;
  const ByteView bytes = message.bytes.subspan(message.layer2Octets);
  if (bytes.size() > longest) return std::nullopt;
  Bytes packet;
  putIPv4Header(packet, ipv4Size + udpSize + gsmtapSize + bytes.size());
  putU16(packet, port);
  putU16(packet, port);
  putU16(packet, udpSize + gsmtapSize + bytes.size());
  putU16(packet, noChecksum);
  packet.insert(packet.end(), {version, wordsOfHeader, *dissector.gsmtapType, timeSlot});
  putU16(packet, gsmtapChannel(message));
  putU16(packet, 0);  // signal level and signal to noise: not known
  putU32(packet, message.frame.value_or(0));
  packet.insert(packet.end(), {dissector.gsmtapSubtype, 0, 0, 0});
  append(packet, bytes);
  return packet;
}

}  // namespace

std::uint16_t linkTypeOf(MessageForm form) {
  return form == MessageForm::Gsmtap ? ipv4LinkType : upperPduLinkType;
}

std::optional<Bytes> messagePacket(const AirMessage& message, MessageForm form) {
  const auto dissector = dissectorOf(message);
  if (!dissector || message.bytes.size() <= message.layer2Octets) return std::nullopt;
  return form == MessageForm::Gsmtap ? gsmtapPacket(message, *dissector) : upperPdu(message, *dissector);
}

std::string messageComment(const AirMessage& message) {
  std::string text(nameOf(message.radio));
  text.append(" ").append(nameOf(message.protocol));
  if (!message.channel.empty()) text.append(" ").append(message.channel);
  if (message.channelNumber)
    text.append(", ")
        .append(channelNumberName(message.radio))
        .append(" ")
        .append(std::to_string(*message.channelNumber));
  if (message.physicalCell)
    text.append(message.radio == Radio::UMTS ? ", scrambling code " : ", cell ")
        .append(std::to_string(*message.physicalCell));
  if (message.frame) text.append(", SFN ").append(std::to_string(*message.frame));
  if (message.frame && message.subframe) text.append(".").append(std::to_string(*message.subframe));
  return text;
}

}  // namespace varnel
