#pragma once

#include <cstdint>
#include <optional>

#include "LogGenerator/PacketVersion.h"

namespace varnel {

/// What becomes of one message.
struct MessageFate {
  enum class Outcome : std::uint8_t {
    Decoded,   ///< at least one decoder takes its log code, version and length, whatever it finds in the
               ///< message
    TooShort,  ///< shorter than a packet header, or than the minimum of every decoder of its log code
    TooLong,   ///< longer than its log code allows
    Unknown,   ///< its log type is unknown, or no decoder takes its log code
    UnknownVersion,  ///< decoders take its log code, but none of them knows its version
  };

  Outcome outcome;
  /// Absent when there is none: the message is shorter than a header, has an unknown log type, or is no
  /// packet.
  std::optional<std::uint32_t> logCode{};
  /// The version that is not known; absent for every other outcome.
  std::optional<PacketVersion> version{};

  friend bool operator==(const MessageFate&, const MessageFate&) = default;
};

}  // namespace varnel
