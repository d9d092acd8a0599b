#include "LogGenerator/Radios/Messages/MessageChoice.h"

#include <bit>
#include <cstddef>
#include <optional>

namespace varnel {

namespace {

// Takes bits off the front, the highest of each byte first.
class BitReader {
 public:
  explicit BitReader(ByteView bytes) : _bytes(bytes) {}

  void skip(std::size_t bits) { _position += bits; }
  // Absent past the end. At most eight bits.
  std::optional<unsigned> take(unsigned bits) {
    unsigned value = 0;
    for (; bits > 0; --bits, ++_position) {
      const std::size_t byte = _position / 8;
      if (byte >= _bytes.size()) return std::nullopt;
      value = value << 1 | (_bytes[byte] >> (7 - _position % 8) & 1U);
    }
    return value;
  }

 private:
  ByteView _bytes;
  std::size_t _position = 0;
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
    if (*isPresent != 0) bits.skip(integrityCheckBits);
  }
  for (const MessageChoice* choice = channel.choice;;) {
    const std::size_t greatest = choice->alternatives.size() - 1;
    const auto index = bits.take(static_cast<unsigned>(std::bit_width(greatest)));
    if (!index) return unknownMessage;
    if (*index > greatest) return spareMessage;
    const MessageChoice::Alternative& alternative = choice->alternatives[*index];
    if (!alternative.choice) return alternative.name;
    choice = alternative.choice;
  }
}

}  // namespace varnel
