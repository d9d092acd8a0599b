#include "programs/varnel-telephonyd/simulation/radios/GSMMessages.h"

#include "programs/varnel-telephonyd/simulation/radios/PackedNetwork.h"

namespace varnel::simulation::gsmMessages {

namespace {

enum Discriminator : std::uint8_t { MobilityManagement = 5, RadioResources = 6 };
constexpr std::size_t blockSize = 23;
constexpr std::uint8_t padding = 0x2B;

// The pseudo length counts the bytes behind it that are no padding.
constexpr std::uint8_t pseudoLength(unsigned length) { return static_cast<std::uint8_t>(length << 2 | 1); }

void appendArea(Bytes& message, const Cell& cell) {
  const auto network = packedNetwork(cell.network);
  message.insert(message.end(), network.begin(), network.end());
  message.push_back(static_cast<std::uint8_t>(cell.area >> 8));
  message.push_back(static_cast<std::uint8_t>(cell.area));
}

void appendIdentity(Bytes& message, std::uint32_t temporaryIdentity) {
  constexpr std::uint8_t temporary = 0xF4;
  message.push_back(5);
  message.push_back(temporary);
  for (int shift = 24; shift >= 0; shift -= 8)
    message.push_back(static_cast<std::uint8_t>(temporaryIdentity >> shift));
}

Bytes filled(Bytes block) {
  block.resize(blockSize, padding);
  return block;
}

constexpr std::uint8_t classmark = 0x33;

}  // namespace

Bytes systemInformation3(const Cell& cell) {
  Bytes message{pseudoLength(18), RadioResources, 0x1B, static_cast<std::uint8_t>(cell.identity >> 8),
                static_cast<std::uint8_t>(cell.identity)};
  appendArea(message, cell);
  const Bytes rest{0x49, 0x05, 0x1E,   // how the control channels are laid out
                   0x2A,               // options of the cell
                   0x65, 0x08,         // when a phone may choose the cell
                   0xB9, 0x00, 0x00};  // random access
  message.insert(message.end(), rest.begin(), rest.end());
  return filled(message);
}

Bytes emptyPaging() { return filled({pseudoLength(5), RadioResources, 0x21, 0x00, 0x01, 0xF0}); }

Bytes channelRelease() {
  constexpr std::uint8_t normal = 0;
  return {RadioResources, 0x0D, normal};
}

Bytes locationUpdateRequest(const Cell& cell, std::uint32_t temporaryIdentity) {
  constexpr std::uint8_t normal = 0x70;
  Bytes message{MobilityManagement, 0x08, normal};
  appendArea(message, cell);
  message.push_back(classmark);
  appendIdentity(message, temporaryIdentity);
  return message;
}

Bytes locationUpdateAccept(const Cell& cell) {
  Bytes message{MobilityManagement, 0x02};
  appendArea(message, cell);
  return message;
}

Bytes serviceRequest(std::uint32_t temporaryIdentity) {
  constexpr std::uint8_t call = 0x01;
  Bytes message{MobilityManagement, 0x24, call, 3, classmark, 0x19, 0x81};
  appendIdentity(message, temporaryIdentity);
  return message;
}

Bytes serviceAccept() { return {MobilityManagement, 0x21}; }

}  // namespace varnel::simulation::gsmMessages
