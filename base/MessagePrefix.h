#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "base/Bytes.h"

namespace varnel {

/// What may come before a packet on the log channel: this byte, and the number of the subscription.
inline constexpr std::uint8_t prefixMark = 0x81;
inline constexpr std::size_t prefixSize = 2;

/// The number of the SIM card that a message of the log channel belongs to. Absent when there is no prefix,
/// or when it says 0.
inline std::optional<std::uint8_t> subscriptionOf(ByteView message) {
  if (message.size() < prefixSize || message[0] != prefixMark || message[1] == 0) return std::nullopt;
  return message[1];
}

/// What the name of a SIM card begins with.
inline constexpr std::string_view subscriptionNameMark = "SIM ";

/// "SIM 2": the SIM card with this number.
inline std::string subscriptionName(std::uint8_t number) {
  return std::string(subscriptionNameMark) + std::to_string(number);
}

}  // namespace varnel
