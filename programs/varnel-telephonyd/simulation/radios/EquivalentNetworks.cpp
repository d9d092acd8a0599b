#include "programs/varnel-telephonyd/simulation/radios/EquivalentNetworks.h"

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/radios/PackedNetwork.h"

namespace varnel::simulation {

Bytes packedEquivalentNetworks(std::chrono::milliseconds now, std::initializer_list<Network> networks) {
  constexpr std::uint16_t code = 0x7150;
  constexpr std::size_t headSize = 17;
  PacketWriter packet(code, now, headSize);
  packet.u8(16, static_cast<std::int64_t>(networks.size()));
  for (const Network& network : networks) packet.append(packedNetwork(network));
  return packet.finish();
}

}  // namespace varnel::simulation
