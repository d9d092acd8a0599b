#include "programs/varnel-telephonyd/simulation/radios/LTENASMessages.h"

#include "programs/varnel-telephonyd/simulation/radios/PackedNetwork.h"

namespace varnel::simulation::lteNAS {

namespace {

enum Discriminator : std::uint8_t { Session = 2, Mobility = 7 };
constexpr std::uint8_t defaultBearer = 5, dedicatedBearer = 7;

void append(Bytes& message, ByteView bytes) { message.insert(message.end(), bytes.begin(), bytes.end()); }

// The length of these bytes, in one byte or in two, then the bytes.
void appendCounted(Bytes& message, ByteView bytes) {
  message.push_back(static_cast<std::uint8_t>(bytes.size()));
  append(message, bytes);
}
void appendCountedTwice(Bytes& message, ByteView bytes) {
  message.push_back(0);
  appendCounted(message, bytes);
}

void appendNumber(Bytes& message, std::uint64_t number, int bytes) {
  for (int byte = bytes - 1; byte >= 0; --byte)
    message.push_back(static_cast<std::uint8_t>(number >> 8 * byte));
}

Bytes mobilityIdentity(const TemporaryName& name) {
  constexpr std::uint8_t globallyUnique = 0xF6;
  Bytes identity{globallyUnique};
  append(identity, packedNetwork(name.network));
  appendNumber(identity, static_cast<std::uint64_t>(name.group), 2);
  appendNumber(identity, static_cast<std::uint64_t>(name.code), 1);
  appendNumber(identity, name.number, 4);
  return identity;
}

Bytes session(std::uint8_t bearer, std::uint8_t transaction, std::uint8_t type) {
  return {static_cast<std::uint8_t>(bearer << 4 | Session), transaction, type};
}

}  // namespace

Bytes attachRequest(const TemporaryName& name) {
  Bytes message{Mobility, 0x41, 0x01};  // for packets, with the first key
  appendCounted(message, mobilityIdentity(name));
  appendCounted(message, Bytes{0xE0, 0xE0});  // the phone's algorithms
  appendCountedTwice(message, connectivityRequest());
  return message;
}

Bytes attachAccept(const TemporaryName& name, int area) {
  constexpr std::uint8_t periodOf54Minutes = 0x49, nameFollows = 0x50, oneNetworkWithAreas = 0x00;
  Bytes message{Mobility, 0x42, 0x01, periodOf54Minutes};
  Bytes areas{oneNetworkWithAreas};
  append(areas, packedNetwork(name.network));
  appendNumber(areas, static_cast<std::uint64_t>(area), 2);
  appendCounted(message, areas);
  appendCountedTwice(message, activateDefaultBearerRequest());
  message.push_back(nameFollows);
  appendCounted(message, mobilityIdentity(name));
  return message;
}

Bytes attachComplete() {
  Bytes message{Mobility, 0x43};
  appendCountedTwice(message, activateDefaultBearerAccept());
  return message;
}

Bytes authenticationRequest(std::uint64_t challenge) {
  Bytes message{Mobility, 0x52, 0x00};
  appendNumber(message, challenge, 8);
  appendNumber(message, ~challenge, 8);
  Bytes token;
  appendNumber(token, challenge * 3, 8);
  appendNumber(token, challenge * 5, 8);
  appendCounted(message, token);
  return message;
}

Bytes authenticationResponse(std::uint64_t challenge) {
  Bytes message{Mobility, 0x53}, response;
  appendNumber(response, challenge * 7, 8);
  appendCounted(message, response);
  return message;
}

Bytes securityModeCommand() {
  constexpr std::uint8_t secondAlgorithms = 0x22, firstKey = 0x00;
  Bytes message{Mobility, 0x5D, secondAlgorithms, firstKey};
  appendCounted(message, Bytes{0xE0, 0xE0});
  return message;
}

Bytes securityModeComplete() { return {Mobility, 0x5E}; }

Bytes areaUpdateRequest(const TemporaryName& name) {
  Bytes message{Mobility, 0x48, 0x00};
  appendCounted(message, mobilityIdentity(name));
  return message;
}

Bytes areaUpdateAccept() { return {Mobility, 0x49, 0x00}; }
Bytes areaUpdateComplete() { return {Mobility, 0x4A}; }

Bytes serviceRequest(int sequence) {
  const auto number = static_cast<std::uint8_t>(sequence % 32);
  return {0xC7, number, static_cast<std::uint8_t>(0x5A ^ number), static_cast<std::uint8_t>(0x31 + number)};
}

Bytes integrityProtected(ByteView content, int sequence) {
  const auto number = static_cast<std::uint8_t>(sequence);
  Bytes message{0x17, 0x8E, static_cast<std::uint8_t>(number * 37), 0x42, 0xC9, number};
  append(message, content);
  return message;
}

Bytes connectivityRequest() {
  Bytes message = session(0, 1, 0xD0);
  message.push_back(0x11);  // a first connection with IPv4
  return message;
}

Bytes activateDefaultBearerRequest() {
  Bytes message = session(defaultBearer, 1, 0xC1);
  appendCounted(message, Bytes{9});  // the class of quality
  appendCounted(message, Bytes{8, 'i', 'n', 't', 'e', 'r', 'n', 'e', 't'});
  appendCounted(message, Bytes{1, 192, 0, 2, 17});
  return message;
}

Bytes activateDefaultBearerAccept() { return session(defaultBearer, 0, 0xC2); }

Bytes activateDedicatedBearerRequest(int guaranteedRateCode) {
  const auto rate = static_cast<std::uint8_t>(guaranteedRateCode);
  Bytes message = session(dedicatedBearer, 0, 0xC5);
  message.push_back(defaultBearer);
  appendCounted(message, Bytes{1, rate, rate, rate, rate});
  // A filter in both directions, for one protocol.
  constexpr std::uint8_t newTemplateOfOne = 0x21, bothWays = 0x30, protocol = 0x30, datagrams = 17;
  appendCounted(message, Bytes{newTemplateOfOne, bothWays, 0, 2, protocol, datagrams});
  return message;
}

Bytes activateDedicatedBearerAccept() { return session(dedicatedBearer, 0, 0xC6); }

Bytes deactivateBearerRequest() {
  constexpr std::uint8_t regular = 36;
  Bytes message = session(dedicatedBearer, 0, 0xCD);
  message.push_back(regular);
  return message;
}

Bytes deactivateBearerAccept() { return session(dedicatedBearer, 0, 0xCE); }

}  // namespace varnel::simulation::lteNAS
