#pragma once

#include <cstdint>
#include <optional>

namespace varnel {

/// What becomes of one message.
struct MessageFate {
  enum class Outcome : std::uint8_t {
    Decoded,   ///< at least one decoder takes its log code and length, whatever it then finds in it
    TooShort,  ///< shorter than a packet header, or than every decoder of its log code wants
    TooLong,   ///< longer than its log code allows
    Unknown,   ///< its log type is unknown, or nobody decodes its log code
  };

  Outcome outcome;
  /// Absent where there is none to tell: the message is shorter than a header, of an unknown log type, or no
  /// packet at all.
  std::optional<std::uint32_t> logCode{};

  friend bool operator==(const MessageFate&, const MessageFate&) = default;
};

}  // namespace varnel
