#include "programs/varnel-telephonyd/simulation/radios/LTERegistration.h"

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/radios/PackedNetwork.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t registrationCode = 0xB0EE, bearerInformationCode = 0xB0E5, bearerStateCode = 0xB0E4;

void putNetwork(PacketWriter& packet, std::size_t offset, const Network& network) {
  for (const std::uint8_t byte : packedNetwork(network)) packet.u8(offset++, byte);
}

}  // namespace

Bytes lteRegistration(const Situation& situation, EMMState state, int substate, const TemporaryName* name) {
  constexpr std::size_t size = 32;
  constexpr std::int64_t temporaryName = 6, noName = 255;
  PacketWriter packet(registrationCode, situation.now, size);
  packet
      .u8(13, 2)  // version
      .u8(14, static_cast<std::int64_t>(state))
      .u16(15, substate)
      .u8(20, name != nullptr)
      .u8(21, name ? temporaryName : noName);
  putNetwork(packet, 17, situation.serving.network);
  if (name) {
    putNetwork(packet, 22, name->network);
    packet.u16(25, name->group).u8(27, name->code).u32(28, name->number);
  }
  return packet.finish();
}

Bytes lteBearerInformation(std::chrono::milliseconds now, const Bearer& bearer, Bearer::State state) {
  constexpr std::size_t size = 33;
  constexpr std::int64_t classAlone = 1, classAndRates = 5;
  return PacketWriter(bearerInformationCode, now, size)
      .u8(13, 1)  // version
      .u8(14, bearer.isDedicated())
      .u8(15, bearer.identity)
      .u8(16, static_cast<std::int64_t>(state))
      .u8(23, bearer.isDedicated() ? classAndRates : classAlone)
      .u8(24, bearer.qualityClass)
      .u8(25, bearer.guaranteedRateCode)
      .u8(26, bearer.guaranteedRateCode)
      .u8(27, bearer.guaranteedRateCode)
      .u8(28, bearer.guaranteedRateCode)
      .finish();
}

Bytes lteBearerState(std::chrono::milliseconds now, const Bearer& bearer, Bearer::State state) {
  constexpr std::size_t size = 17;
  constexpr std::int64_t firstBearer = 5;
  return PacketWriter(bearerStateCode, now, size)
      .u8(13, 1)  // version
      .u8(14, bearer.identity)
      .u8(15, static_cast<std::int64_t>(state))
      .u8(16, bearer.identity - firstBearer)
      .finish();
}

}  // namespace varnel::simulation
