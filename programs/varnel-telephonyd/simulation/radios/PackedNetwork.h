#pragma once

#include <array>

#include "programs/varnel-telephonyd/simulation/Cell.h"

namespace varnel::simulation {

/// A network's codes as three bytes (TS 24.008 10.5.1.3). A network code of two digits has a filler.
constexpr std::array<std::uint8_t, 3> packedNetwork(const Network& network) {
  constexpr int filler = 0xF;
  const int country = network.countryCode, code = network.networkCode;
  const bool isShort = network.networkCodeDigits == 2;
  const int third = isShort ? filler : code % 10, firstTwo = isShort ? code : code / 10;
  return {static_cast<std::uint8_t>(country / 10 % 10 << 4 | country / 100),
          static_cast<std::uint8_t>(third << 4 | country % 10),
          static_cast<std::uint8_t>(firstTwo % 10 << 4 | firstTwo / 10)};
}

}  // namespace varnel::simulation
