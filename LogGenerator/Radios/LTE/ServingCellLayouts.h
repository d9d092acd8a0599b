#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <optional>
#include <span>
#include <string_view>
#include <utility>

#include "LogGenerator/Field.h"
#include "LogGenerator/Radios/PacketLayout.h"

namespace varnel {
class SectionFormats;
}

/// The packet 0xB193: how strong the cells of a carrier are. Each of its subpackets is one carrier, with its
/// serving cell and maybe neighbors. Several decoders read it.
namespace varnel::lte {

/// The largest channel number and the largest physical cell identity of LTE, 3GPP TS 36.101 and TS 36.211. A
/// packet that names a larger one holds something else.
inline constexpr std::uint32_t largestEARFCN = 262143, largestPhysicalCell = 503;

inline constexpr Format rsrpFormat = real("%.2f dBm", 1.0 / 16, -180.0);
inline constexpr Format rsrqFormat = real("%.2f dB", 1.0 / 16, -30.0);
inline constexpr Format rssiFormat = real("%.2f dBm", 1.0 / 16, -110.0);

/// The entries that show what an antenna measures: RSRP, RSRQ, RSSI and SNR.
inline constexpr std::string_view antennaLabels[][4] = {
    {"RSRP Rx0", "RSRQ Rx0", "RSSI Rx0", "SNR Rx0"},
    {"RSRP Rx1", "RSRQ Rx1", "RSSI Rx1", "SNR Rx1"},
    {"RSRP Rx2", "RSRQ Rx2", "RSSI Rx2", "SNR Rx2"},
    {"RSRP Rx3", "RSRQ Rx3", "RSSI Rx3", "SNR Rx3"},
};

/// One version of the subpacket. The offsets of its cells' fields count from the cell's first byte.
struct ServingCellLayout {
  static constexpr std::size_t mostAntennas = std::size(antennaLabels);

  /// In the order of the labels.
  using Antenna = std::array<Field, 4>;

  std::uint8_t version = 0;
  Field channel{};
  Source count{};               ///< how many cells follow; a width of 0: there is one
  std::size_t first = 0;        ///< offset of the first cell
  std::size_t stride = 0;       ///< from one cell to the next
  std::size_t cellSize = 0;     ///< from a cell's first byte to the end of its last field
  std::size_t minimumSize = 0;  ///< of the subpacket, with its first four bytes
  Source physicalCell{};
  Source servingIndex{}, isServing{};  ///< a width of 0: the cells do not tell whether they serve
  std::size_t antennaCount = 0;
  std::size_t antennaFieldCount = 0;  ///< 3 where the place of SNR is not known
  std::array<Antenna, mostAntennas> antennas{};
  std::array<Field, 10> fields{};  ///< physical cell; RSRP, RSRQ, RSSI of all antennas together; others
  std::size_t fieldCount = 0;

  bool tellsServing() const { return isServing.width > 0; }
  std::span<const Field> cellFields() const { return std::span(fields).first(fieldCount); }
  /// RSRP, RSRQ and RSSI of all antennas together.
  std::span<const Field> levels() const { return std::span(fields).subspan(1, 3); }
  std::span<const Field> antenna(std::size_t index) const {
    return std::span(antennas[index]).first(antennaFieldCount);
  }
  /// Whether the cell was measured with this antenna. Of an unused antenna all values are 0.
  bool usesAntenna(const Packet& cell, std::size_t index) const;
};

/// The layout of a subpacket, which must be one of those that `servingCellPacketsAnd` lists.
const ServingCellLayout& servingCellLayoutOf(const Packet& subpacket);

/// A cell of a subpacket.
struct MeasuredCell {
  Packet bytes;
  std::uint16_t physicalCell;
  /// 0 for the primary cell, 1 and more for the secondary cells; absent for a neighbor. Where the cells do
  /// not tell, the first one is the primary cell.
  std::optional<std::uint8_t> servingIndex;
};

/// Whether the subpacket's channel and all its cells can be those of an LTE network.
bool isPlausible(const ServingCellLayout& layout, const Packet& subpacket);

/// The cell at an index. Nothing for one that is not counted, or whose fields do not lie wholly in the
/// subpacket. Then all further ones are missing too.
std::optional<MeasuredCell> measuredCellAt(const ServingCellLayout& layout, const Packet& subpacket,
                                           std::size_t index);

/// Calls `take(const MeasuredCell&)` for each cell.
template <class Take>
void forEachMeasuredCell(const ServingCellLayout& layout, const Packet& subpacket, Take take) {
  for (std::size_t i = 0; const auto cell = measuredCellAt(layout, subpacket, i); ++i) take(*cell);
}

/// Adds the formats of the entries that show a cell.
void listServingCellFormats(SectionFormats& formats);

namespace servingCell {

inline constexpr std::uint32_t logCode = 0xB193;
inline constexpr std::uint8_t version = 1, subpacket = 25;

// The versions of the subpacket, and how short each may be: with its one cell, or up to where the cells
// begin.
struct Minimum {
  std::uint8_t version;
  std::size_t size;
};
inline constexpr Minimum minimums[] = {{4, 68},  {7, 72},  {18, 76}, {19, 12}, {22, 12}, {24, 12},
                                       {35, 12}, {36, 12}, {40, 12}, {48, 16}, {50, 16}, {60, 12}};

template <std::size_t... index, std::size_t... other, std::size_t others>
consteval auto packetsAnd(PacketLayout::Method method, std::index_sequence<index...>,
                          const std::array<PacketLayout, others>& further, std::index_sequence<other...>) {
  return std::array{PacketLayout(logCode, version, minimums[index].size, method)
                        .inSubpacket(subpacket, minimums[index].version)...,
                    further[other]...};
}

}  // namespace servingCell

inline constexpr std::size_t servingCellVersions = std::size(servingCell::minimums);

/// The packets of a decoder: all versions of this one, each read with the same function, then others.
template <std::size_t others = 0>
consteval auto servingCellPacketsAnd(PacketLayout::Method method,
                                     const std::array<PacketLayout, others>& further = {}) {
  return servingCell::packetsAnd(method, std::make_index_sequence<servingCellVersions>(), further,
                                 std::make_index_sequence<others>());
}

}  // namespace varnel::lte
