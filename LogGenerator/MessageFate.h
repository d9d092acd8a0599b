#pragma once

#include <cstdint>
#include <optional>

namespace varnel {

/// What becomes of one message.
struct MessageFate {
  enum class Outcome : std::uint8_t {
    Decoded,   ///< at least one decoder takes its log code and length, whatever it finds in the message
    TooShort,  ///< shorter than a packet header, or than the minimum of every decoder of its log code
    TooLong,   ///< longer than its log code allows
    Unknown,   ///< its log type is unknown, or no decoder takes its log code
  };

  Outcome outcome;
  /// Absent when there is none: the message is shorter than a header, has an unknown log type, or is no
  /// packet.
  std::optional<std::uint32_t> logCode{};

  friend bool operator==(const MessageFate&, const MessageFate&) = default;
};

}  // namespace varnel
