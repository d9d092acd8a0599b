#include "LogGenerator/Radios/Messages/MessageChoice.h"

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <optional>

namespace varnel {

namespace {

// Takes bits off the front of a message, the highest of each byte first. The choices of all channels lie
// within the first eight bytes.
class BitReader {
 public:
  explicit BitReader(ByteView bytes) : _left(8 * std::min<std::size_t>(bytes.size(), sizeof _bits)) {
    for (std::size_t i = 0; i < sizeof _bits; ++i) _bits = _bits << 8 | (i < bytes.size() ? bytes[i] : 0U);
  }

  // Absent past the end. Fewer than 64 bits.
  std::optional<std::size_t> take(std::size_t count) {
    if (count > _left) return std::nullopt;
    if (count == 0) return 0;
    const std::uint64_t value = _bits >> (64 - count);
    _bits <<= count;
    _left -= count;
    return value;
  }

 private:
  std::uint64_t _bits = 0;
  std::size_t _left;
};

// The authentication code of 32 bits and the sequence number of 4.
constexpr std::size_t integrityCheckBits = 36;

}  // namespace

std::string_view messageName(const MessageChannel& channel, ByteView bytes) {
  if (!channel.choice) return channel.message;
  BitReader bits(bytes);
  if (channel.integrityCheck == MessageChannel::IntegrityCheck::Optional) {
    const auto isPresent = bits.take(1);
    if (!isPresent) return unknownMessage;
    if (*isPresent != 0 && !bits.take(integrityCheckBits)) return unknownMessage;
  }
  for (const MessageChoice* choice = channel.choice;;) {
    const std::size_t greatest = choice->alternatives.size() - 1;
    const auto index = bits.take(static_cast<std::size_t>(std::bit_width(greatest)));
    if (!index) return unknownMessage;
    if (*index > greatest) return spareMessage;
    const MessageChoice::Alternative& alternative = choice->alternatives[*index];
    if (!alternative.choice) return alternative.name;
    choice = alternative.choice;
  }
}

}  // namespace varnel
