#include "host/captures/FrameChecksum.h"

#include <array>

#include "host/captures/ChecksumFolding.h"
#include "host/captures/LittleEndian.h"

namespace varnel {

namespace {

constexpr std::uint16_t polynomial = 0x8408;
constexpr std::uint16_t start = 0xFFFF;
// The checksum over a sound frame including its own checksum.
constexpr std::uint16_t residue = 0xF0B8;

using Table = std::array<std::uint16_t, 256>;

// tables[n][b]: the effect of byte b on the checksum when n more bytes follow it.
constexpr std::size_t stride = 16;

constexpr std::array<Table, stride> makeTables() {
  std::array<Table, stride> tables{};
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

constexpr std::array<Table, stride> tables = makeTables();

// The effect of four and of eight bytes on the checksum when this many more bytes follow them.
template <std::size_t following>
std::uint32_t effectOfFour(std::uint32_t bytes) {
  return tables[following + 3][bytes & 0xFF] ^ tables[following + 2][bytes >> 8 & 0xFF] ^
         tables[following + 1][bytes >> 16 & 0xFF] ^ tables[following][bytes >> 24];
}

template <std::size_t following>
std::uint32_t effectOfEight(std::uint64_t bytes) {
  return effectOfFour<following + 4>(static_cast<std::uint32_t>(bytes)) ^
         effectOfFour<following>(static_cast<std::uint32_t>(bytes >> 32));
}

// The register already has the effect of the bytes before, so it is combined with the first two of these
// bytes. The effects of the other bytes do not depend on it.
template <std::size_t count>
std::uint32_t effectOfRest(std::uint32_t rest) {
  return tables[count - 1][rest & 0xFF] ^ tables[count - 2][rest >> 8];
}

std::uint16_t registerAfter(ByteView bytes) {
  std::uint32_t rest = start;
  std::size_t i = 0;
  for (; bytes.size() - i >= 16; i += 16) {
    const std::uint32_t effect = effectOfEight<8>(loadLittleEndian<std::uint64_t>(bytes, i)) ^
                                 effectOfEight<0>(loadLittleEndian<std::uint64_t>(bytes, i + 8));
    rest = effect ^ effectOfRest<16>(rest);
  }
  if (bytes.size() - i >= 8) {
    rest = effectOfEight<0>(loadLittleEndian<std::uint64_t>(bytes, i)) ^ effectOfRest<8>(rest);
    i += 8;
  }
  if (bytes.size() - i >= 4) {
    rest = effectOfFour<0>(loadLittleEndian<std::uint32_t>(bytes, i)) ^ effectOfRest<4>(rest);
    i += 4;
  }
  for (; i < bytes.size(); ++i) rest = rest >> 8 ^ tables[0][(rest ^ bytes[i]) & 0xFF];
  return static_cast<std::uint16_t>(rest);
}

}  // namespace

std::uint16_t frameChecksum(ByteView contents) {
  return static_cast<std::uint16_t>(~registerAfter(contents));
}

bool isSound(ByteView frame) {
  if (frame.size() >= leastToFold && canFold()) return isSoundByFolding(frame);
  return registerAfter(frame) == residue;
}

}  // namespace varnel
