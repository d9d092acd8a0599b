#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <optional>

#include "base/Bytes.h"

namespace varnel {

/// What follows a message. Several of these may follow.
enum AfterMessage : std::uint8_t { Generate = 1, Save = 2, Reconnect = 4 };

/// One step of a generator's input: what follows the message (1 byte), the message's length (2,
/// little-endian), and the message.
struct InputStep {
  std::uint8_t after;
  ByteView message;
};

inline constexpr std::size_t stepHeaderSize = 3;

inline void appendStep(Bytes& input, const InputStep& step) {
  input.push_back(step.after);
  input.push_back(static_cast<std::uint8_t>(step.message.size()));
  input.push_back(static_cast<std::uint8_t>(step.message.size() >> 8U));
  input.insert(input.end(), step.message.begin(), step.message.end());
}

/// Takes the first step; nothing at the end. The last message may be shorter than its length says.
inline std::optional<InputStep> takeStep(ByteView& input) {
  if (input.size() < stepHeaderSize) return std::nullopt;
  const std::size_t stated = input[1] | std::size_t{input[2]} << 8U;
  const std::uint8_t after = input[0];
  const std::size_t length = std::min(stated, input.size() - stepHeaderSize);
  const ByteView message = input.subspan(stepHeaderSize, length);
  input = input.subspan(stepHeaderSize + length);
  return InputStep{after, message};
}

}  // namespace varnel
