#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/Packet.h"

namespace varnel {

/// The connected-mode intra-frequency measurement, log code 0xB179: the serving cell, then the records of
/// neighbors, then the records of detected cells.
namespace connectedModeMeasurement {

inline constexpr std::uint32_t logCode = 0xB179;
inline constexpr std::size_t minimumSize = 29;
inline constexpr std::size_t neighborSize = 6;
inline constexpr std::size_t detectedCellSize = 2;

inline std::uint8_t neighborCount(const Packet& packet) { return packet.u8(27); }
inline std::uint8_t detectedCellCount(const Packet& packet) { return packet.u8(28); }
inline constexpr std::size_t firstNeighbor = minimumSize;
inline std::size_t firstDetectedCell(const Packet& packet) {
  return firstNeighbor + neighborSize * neighborCount(packet);
}

}  // namespace connectedModeMeasurement

}  // namespace varnel
