#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

#include "LogGenerator/Field.h"
#include "LogGenerator/Radios/LTE/ServingCellLayouts.h"

namespace varnel::lte {

/// One version of a packet, or of its subpacket, that lists the neighbors on one channel. Offsets count from
/// the payload's first byte, or from the subpacket's; those of a neighbor's fields from the neighbor's.
struct NeighborLayout {
  std::uint32_t logCode;
  std::uint8_t version, subpacket, subpacketVersion;
  Source channel, count;
  Source ownCell;       ///< the serving cell; a width of 0: the packet does not tell it
  Source physicalCell;  ///< of a neighbor
  std::size_t minimumSize;
  std::size_t first, stride;
  std::size_t cellSize;           ///< from a neighbor's first byte to the end of its last field
  std::span<const Field> levels;  ///< RSRP first
  std::string_view source;        ///< the packet's name in the display
};

// Levels of the connected mode, of its search on other channels, and of the idle mode.
inline constexpr Field intraFrequencyLevels[] = {{s16(2), "RSRP", rsrpFormat}, {s16(6), "RSRQ", rsrqFormat}};
inline constexpr Field searchLevels[] = {
    {bits(12, 0, 12), "RSRP", rsrpFormat},
    {bits(21, 2, 10), "RSRQ", rsrqFormat},
    {bits(29, 3, 11), "RSSI", rssiFormat},
};
inline constexpr Field idleLevels[] = {
    {bits(2, 4, 12), "RSRP", rsrpFormat},
    {bits(9, 4, 10), "RSRQ", rsrqFormat},
    {bits(1, 1, 11), "RSSI", rssiFormat},
};

inline constexpr Source notTold{};

// clang-format off
inline constexpr NeighborLayout neighborLayouts[] = {
    // Code  Version Subpacket  Channel  Count           Own cell  Cell             Min First Stride Size  Levels                 Source
    {0xB179,  3,      0,  0,    u16(8),  u8(22),         u16(10),  u16(0),           24,   24,   12,   8,  intraFrequencyLevels, "0xB179"},
    {0xB179,  4,      0,  0,    u32(8),  u8(24),         u16(12),  u16(0),           28,   28,   12,   8,  intraFrequencyLevels, "0xB179"},
    {0xB180,  4,      0,  0,    u16(4),  bits(6, 6, 10), notTold,  bits(0, 0, 9),     8,    8,   32,  18,  idleLevels,           "0xB180"},
    {0xB180,  5,      0,  0,    u32(4),  bits(8, 6, 26), notTold,  bits(0, 0, 9),    12,   12,   32,  18,  idleLevels,           "0xB180"},
    {0xB192,  1,     27,  2,    u16(4),  bits(6, 0, 6),  notTold,  bits(0, 0, 10),    8,    8,   52,  32,  searchLevels,         "0xB192"},
    {0xB192,  1,     27,  4,    u32(4),  bits(8, 0, 6),  notTold,  bits(0, 0, 10),   12,   12,   52,  32,  searchLevels,         "0xB192"},
    {0xB195,  1,     31,  3,    u16(4),  bits(6, 0, 6),  notTold,  bits(0, 0, 10),    8,    8,   52,  32,  searchLevels,         "0xB195"},
    {0xB195,  1,     31,  4,    u32(4),  bits(8, 0, 6),  notTold,  bits(0, 0, 10),   12,   12,   52,  32,  searchLevels,         "0xB195"},
    {0xB195,  1,     31, 24,    u32(4),  bits(8, 0, 6),  notTold,  bits(0, 0, 10),   12,   12,   52,  32,  searchLevels,         "0xB195"},
};
// clang-format on

}  // namespace varnel::lte
