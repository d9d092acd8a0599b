#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

#include "LogGenerator/Packet.h"

namespace varnel {

/// The number of a network (PLMN) as a display shows it: "310-260", or "262-02" when the network code has two
/// digits. Empty when a digit is none, as where the modem has no network.

/// Reads three packed octets (3GPP TS 24.008, 10.5.1.3).
std::string plmnText(const Packet& packet, std::size_t offset);
/// Takes the two codes as numbers. The network code has two or three digits; empty for any other count, and
/// for a code that has more digits.
std::string plmnText(std::uint32_t countryCode, std::uint32_t networkCode, std::uint32_t networkDigits);

}  // namespace varnel
