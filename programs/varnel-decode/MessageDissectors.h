#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "LogGenerator/Radios/AirMessage.h"

namespace varnel {

/// What a packet analyzer calls the messages of one kind.
struct MessageDissector {
  std::string_view name;                     ///< of the dissector that Wireshark has for them
  std::optional<std::uint8_t> gsmtapType{};  ///< absent when GSMTAP version 2 has none
  std::uint8_t gsmtapSubtype = 0;
};

/// Nothing for messages that no dissector reads: of an unknown channel, or of one that carries no messages.
std::optional<MessageDissector> dissectorOf(const AirMessage& message);

}  // namespace varnel
