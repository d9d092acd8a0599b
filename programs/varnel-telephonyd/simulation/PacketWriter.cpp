#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

#include <algorithm>
#include <utility>

namespace varnel::simulation {

PacketWriter::PacketWriter(std::uint16_t code, std::chrono::milliseconds now, std::size_t size, LogType type)
    : _bytes(size) {
  u8(0, static_cast<std::uint8_t>(type)).u16(3, code).u64(5, now.count());
}

PacketWriter& PacketWriter::put(std::size_t offset, std::size_t width, std::int64_t number) {
  for (std::size_t i = 0; i < width; ++i)
    _bytes.at(_start + offset + i) = static_cast<std::uint8_t>(number >> 8 * i);
  return *this;
}

PacketWriter& PacketWriter::bits(std::size_t offset, unsigned firstBit, unsigned width, std::int64_t number) {
  const std::int64_t field = std::clamp<std::int64_t>(number, 0, (std::int64_t{1} << width) - 1) << firstBit;
  for (std::size_t i = 0; 8 * i < firstBit + width; ++i)
    _bytes.at(_start + offset + i) |= static_cast<std::uint8_t>(field >> 8 * i);
  return *this;
}

PacketWriter& PacketWriter::record(std::size_t size) {
  _start = _bytes.size();
  _bytes.resize(_start + size);
  return *this;
}

PacketWriter& PacketWriter::append(ByteView bytes) {
  _start = _bytes.size();
  _bytes.insert(_bytes.end(), bytes.begin(), bytes.end());
  return *this;
}

PacketWriter& PacketWriter::padTo(std::size_t size) { return record(size - _bytes.size()); }

Bytes PacketWriter::finish() {
  _start = 0;
  u16(1, std::ssize(_bytes) - 1);
  return std::move(_bytes);
}

Bytes serverMessage(std::uint16_t code, std::chrono::milliseconds now, ByteView payload) {
  const std::size_t size = PacketWriter::headerSize + payload.size();
  Bytes message = PacketWriter(code, now, size, PacketWriter::LogType::Server).finish();
  std::ranges::copy(payload, message.begin() + PacketWriter::headerSize);
  return message;
}

}  // namespace varnel::simulation
