#include "host/PortFrame.h"

namespace varnel {

namespace {

constexpr std::size_t headerSize = 9;
constexpr std::size_t lengthOffset = 0;
constexpr std::size_t identifierOffset = 4;
constexpr std::size_t markOffset = 8;

void appendLittleEndian(Bytes& bytes, std::uint32_t number) {
  for (int shift = 0; shift < 32; shift += 8) bytes.push_back(static_cast<std::uint8_t>(number >> shift));
}

std::uint32_t littleEndian(ByteView bytes, std::size_t offset) {
  std::uint32_t number = 0;
  for (std::size_t i = 0; i < 4; ++i) number |= std::uint32_t{bytes[offset + i]} << (8 * i);
  return number;
}

}  // namespace

void appendFrame(Bytes& bytes, const Frame& frame) {
  bytes.reserve(bytes.size() + headerSize + frame.payload.size());
  appendLittleEndian(bytes, static_cast<std::uint32_t>(frame.payload.size()));
  appendLittleEndian(bytes, static_cast<std::uint32_t>(frame.identifier));
  bytes.push_back(static_cast<std::uint8_t>(frame.mark));
  bytes.insert(bytes.end(), frame.payload.begin(), frame.payload.end());
}

void FrameReader::feed(ByteView bytes) {
  if (_isFaulty) return;
  _bytes.erase(_bytes.begin(), _bytes.begin() + static_cast<std::ptrdiff_t>(_taken));
  _taken = 0;
  _bytes.insert(_bytes.end(), bytes.begin(), bytes.end());
}

std::optional<Frame> FrameReader::next() {
  const ByteView rest = ByteView(_bytes).subspan(_taken);
  if (rest.size() < headerSize) return std::nullopt;
  const std::uint32_t length = littleEndian(rest, lengthOffset);
  const std::uint8_t mark = rest[markOffset];
  if (length > maximumPayload || mark > static_cast<std::uint8_t>(FrameMark::NoReply)) {
    giveUp();
    return std::nullopt;
  }
  if (rest.size() - headerSize < length) return std::nullopt;
  _taken += headerSize + length;
  return Frame{static_cast<std::int32_t>(littleEndian(rest, identifierOffset)), static_cast<FrameMark>(mark),
               rest.subspan(headerSize, length)};
}

void FrameReader::giveUp() {
  _isFaulty = true;
  _bytes = {};
  _taken = 0;
}

}  // namespace varnel
