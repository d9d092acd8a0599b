#include "host/captures/FrameChecksum.h"

#include <array>

#include "host/captures/LittleEndian.h"

namespace varnel {

namespace {

constexpr std::uint16_t polynomial = 0x8408;
constexpr std::uint16_t start = 0xFFFF;
// What is left when a checksum is taken over a sound frame and its own checksum.
constexpr std::uint16_t residue = 0xF0B8;

using Table = std::array<std::uint16_t, 256>;

// tables[n][b]: what the byte b does to the checksum when n more bytes follow it.
constexpr std::array<Table, 8> makeTables() {
  std::array<Table, 8> tables{};
  for (unsigned byte = 0; byte < 256; ++byte) {
    unsigned rest = byte;
    for (int bit = 0; bit < 8; ++bit) rest = rest & 1 ? rest >> 1 ^ polynomial : rest >> 1;
    tables[0][byte] = static_cast<std::uint16_t>(rest);
  }
  for (std::size_t n = 1; n < tables.size(); ++n) {
    for (unsigned byte = 0; byte < 256; ++byte) {
      const unsigned before = tables[n - 1][byte];
      tables[n][byte] = static_cast<std::uint16_t>(before >> 8 ^ tables[0][before & 0xFF]);
    }
  }
  return tables;
}

constexpr std::array<Table, 8> tables = makeTables();

std::uint16_t registerAfter(ByteView bytes) {
  std::uint32_t rest = start;
  std::size_t i = 0;
  for (; bytes.size() - i >= 8; i += 8) {
    const std::uint64_t eight = loadLittleEndian<std::uint64_t>(bytes, i) ^ rest;
    rest = tables[7][eight & 0xFF] ^ tables[6][eight >> 8 & 0xFF] ^ tables[5][eight >> 16 & 0xFF] ^
           tables[4][eight >> 24 & 0xFF] ^ tables[3][eight >> 32 & 0xFF] ^ tables[2][eight >> 40 & 0xFF] ^
           tables[1][eight >> 48 & 0xFF] ^ tables[0][eight >> 56];
  }
  for (; i < bytes.size(); ++i) rest = rest >> 8 ^ tables[0][(rest ^ bytes[i]) & 0xFF];
  return static_cast<std::uint16_t>(rest);
}

}  // namespace

std::uint16_t frameChecksum(ByteView contents) {
  return static_cast<std::uint16_t>(~registerAfter(contents));
}

bool isSound(ByteView frame) { return registerAfter(frame) == residue; }

}  // namespace varnel
