#pragma once

#include <cstdint>

namespace varnel::nr {

/// Whether a cell of NR can have this physical cell identity (3GPP TS 38.211, 7.4.2.1) and a channel of this
/// number (3GPP TS 38.104, table 5.4.2.1-1). A packet with another one has a layout of its own, whatever its
/// version says.
constexpr bool isPhysicalCell(std::uint32_t identity) { return identity <= 1007; }
constexpr bool isChannel(std::uint32_t nrArfcn) { return nrArfcn <= 3279165; }

}  // namespace varnel::nr
