#include "programs/varnel-telephonyd/simulation/radios/PerWriter.h"

namespace varnel::simulation {

PerWriter& PerWriter::bits(unsigned width, std::uint64_t number) {
  while (width-- > 0) {
    if (_free == 0) {
      _bytes.push_back(0);
      _free = 8;
    }
    --_free;
    _bytes.back() |= static_cast<std::uint8_t>((number >> width & 1) << _free);
  }
  return *this;
}

PerWriter& PerWriter::bytes(ByteView bytes) {
  for (const std::uint8_t byte : bytes) bits(8, byte);
  return *this;
}

PerWriter& PerWriter::octetString(ByteView octets) { return bits(8, octets.size()).bytes(octets); }

}  // namespace varnel::simulation
