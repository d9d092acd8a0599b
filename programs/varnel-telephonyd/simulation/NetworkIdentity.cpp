#include "programs/varnel-telephonyd/simulation/NetworkIdentity.h"

#include <array>
#include <span>

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t servingNetworkCode = 0x7135, equivalentNetworksCode = 0x7150;

constexpr Network equalsOfHome[] = {partnerNetwork, distantNetwork}, equalsOfPartner[] = {homeNetwork};

constexpr std::int64_t digit(int number, int place) {
  for (; place > 0; --place) number /= 10;
  return number % 10;
}

// The three digits of the network code. A code of two digits has a filler as its third.
std::array<std::int64_t, 3> codedDigits(const Network& network) {
  constexpr std::int64_t filler = 0xF;
  const int code = network.networkCode;
  if (network.networkCodeDigits == 2) return {digit(code, 1), digit(code, 0), filler};
  return {digit(code, 2), digit(code, 1), digit(code, 0)};
}

}  // namespace

Bytes servingNetwork(const Situation& situation, Service service) {
  constexpr std::size_t size = 32;
  constexpr std::int64_t pagesForBoth = 0, pagesApart = 1;
  const Cell& cell = situation.serving;
  const int country = cell.network.countryCode;
  const auto [first, second, third] = codedDigits(cell.network);
  return PacketWriter(servingNetworkCode, situation.now, size)
      .u8(13, cell.access == Access::GSM ? pagesApart : pagesForBoth)  // the operating mode
      .u8(14, static_cast<std::int64_t>(service))
      .u8(15, digit(country, 1) << 4 | digit(country, 2))
      .u8(16, third << 4 | digit(country, 0))
      .u8(17, second << 4 | first)
      .u8(18, cell.area >> 8)  // the only number that begins with its high byte
      .u8(19, cell.area)
      .u8(20, cell.area % 100)  // each location area is a routing area
      .finish();
}

// A network is six digits: digits of its two codes by turns. But the next network begins after the third of
// them. In these lists, the digits that two networks share are the same for both.
Bytes equivalentNetworks(const Situation& situation, bool isRegistered) {
  constexpr std::size_t headSize = 17, stride = 3, networkSize = 6;
  std::span<const Network> networks;
  if (isRegistered && situation.serving.network == homeNetwork) networks = equalsOfHome;
  if (isRegistered && situation.serving.network == partnerNetwork) networks = equalsOfPartner;

  const std::size_t lastOnes = networks.empty() ? 0 : networkSize - stride;
  PacketWriter packet(equivalentNetworksCode, situation.now, headSize + stride * networks.size() + lastOnes);
  packet.u8(16, std::ssize(networks));
  std::size_t record = headSize;
  for (const Network& network : networks) {
    for (int i = 0; i < 3; ++i) {
      const std::size_t pair = record + 2 * static_cast<std::size_t>(i);
      packet.u8(pair, digit(network.countryCode, 2 - i)).u8(pair + 1, digit(network.networkCode, 2 - i));
    }
    record += stride;
  }
  return packet.finish();
}

}  // namespace varnel::simulation
