#pragma once

#include <cstdint>

#include "base/Bytes.h"

namespace varnel {

/// The checksum of a frame: CRC-16 with the reflected polynomial 0x8408, start and final inversion (ITU-T
/// V.41, as X.25 uses it). Of "123456789" it is 0x906E.
std::uint16_t frameChecksum(ByteView contents);

/// Whether the frame, with its two bytes of checksum at the end, is sound.
bool isSound(ByteView frame);

}  // namespace varnel
