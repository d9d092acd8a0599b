#include "host/captures/FrameEncoding.h"

#include <cstdint>

#include "host/captures/FrameChecksum.h"

namespace varnel {

namespace {

constexpr std::uint8_t frameEnd = 0x7E, escape = 0x7D, escapeBit = 0x20;

void appendEscaped(Bytes& stream, std::uint8_t byte) {
  const bool isSpecial = byte == frameEnd || byte == escape;
  if (isSpecial) stream.push_back(escape);
  stream.push_back(isSpecial ? byte ^ escapeBit : byte);
}

}  // namespace

void appendFramed(Bytes& stream, ByteView contents) {
  const std::uint16_t checksum = frameChecksum(contents);
  for (const std::uint8_t byte : contents) appendEscaped(stream, byte);
  appendEscaped(stream, static_cast<std::uint8_t>(checksum & 0xFF));
  appendEscaped(stream, static_cast<std::uint8_t>(checksum >> 8));
  stream.push_back(frameEnd);
}

}  // namespace varnel
