#include "LogGenerator/Radios/LTE/Measurements.h"

#include <array>
#include <string_view>

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Radios/LTE/ServingCellLayouts.h"
#include "LogGenerator/Radios/ShownNumber.h"

namespace varnel::lte {

namespace {

// The measurement of the idle mode. Its version 4 has a channel number of two bytes, so the rest begins
// earlier.
constexpr Format limit = integer("%d dBm", 1, -30);

constexpr Field idle4[] = {
    {u16(4), "EARFCN"},
    {bits(6, 0, 9), "Physical Cell ID"},
    {bits(7, 1, 7), "Cell Priority"},
    {bits(8, 0, 12), "RSRP", rsrpFormat},
    {bits(12, 0, 12), "Average RSRP", rsrpFormat},
    {bits(16, 0, 10), "RSRQ", rsrqFormat},
    {bits(18, 4, 10), "Average RSRQ", rsrqFormat},
    {bits(21, 2, 11), "RSSI", rssiFormat},
    {bits(24, 0, 6), "Qrxlevmin", integer("%d dBm", 2, -140)},
    {bits(24, 6, 7), "P-Max", limit},
    {bits(25, 5, 6), "Max UE Tx Power", limit},
    {bits(26, 3, 7), "Srxlev", integer("%d dB", 1, -50)},
    {bits(28, 0, 6), "S Intra Search"},
    {bits(28, 6, 6), "S Non Intra Search"},
};

constexpr Field idle5[] = {
    {u32(4), "EARFCN"},
    {bits(8, 0, 9), "Physical Cell ID"},
    {bits(9, 1, 7), "Cell Priority"},
    {bits(12, 0, 12), "RSRP", rsrpFormat},
    {bits(16, 0, 12), "Average RSRP", rsrpFormat},
    {bits(20, 0, 10), "RSRQ", rsrqFormat},
    {bits(22, 4, 10), "Average RSRQ", rsrqFormat},
    {bits(25, 2, 11), "RSSI", rssiFormat},
    {bits(28, 0, 6), "Qrxlevmin", integer("%d dBm", 2, -140)},
    {bits(28, 6, 7), "P-Max", limit},
    {bits(29, 5, 6), "Max UE Tx Power", limit},
    {bits(30, 3, 7), "Srxlev", integer("%d dB", 1, -50)},
    {bits(32, 0, 6), "S Intra Search"},
    {bits(32, 6, 6), "S Non Intra Search"},
};

// Up to the end of the last field's word.
constexpr std::size_t idle4Size = 32, idle5Size = 36;
static_assert(extent(idle4) <= idle4Size && extent(idle5) <= idle5Size);

constexpr Format blank = choice({}, "");

// What an antenna shows that is not used.
constexpr auto unusedAntennas = [] {
  std::array<ServingCellLayout::Antenna, ServingCellLayout::mostAntennas> antennas{};
  for (std::size_t i = 0; i < antennas.size(); ++i) {
    for (std::size_t kind = 0; kind < antennas[i].size(); ++kind)
      antennas[i][kind] = {u8(0), antennaLabels[i][kind], blank};
  }
  return antennas;
}();

// What only some of the packets carry. These entries are wrong for another cell.
constexpr std::string_view entriesOfSomePackets[] = {
    "Filtered RSRP", "Filtered RSRQ",   "Projected SIR", "RSRQ after Cancellation", "System Frame Number",
    "Subframe",      "Average RSRP",    "Average RSRQ",  "Cell Priority",           "Qrxlevmin",
    "P-Max",         "Max UE Tx Power", "Srxlev",        "S Intra Search",          "S Non Intra Search",
};

}  // namespace

constinit const std::array<PacketLayout, servingCellVersions + 2> Measurements::packets =
    servingCellPacketsAnd(calling<&Measurements::updateServingCell>,
                          std::array{PacketLayout(0xB17F, 4, idle4Size, calling<&Measurements::updateIdle>),
                                     PacketLayout(0xB17F, 5, idle5Size, calling<&Measurements::updateIdle>)});

Measurements::Measurements() : VersionedDecoder("Measurements", packets) {}

void Measurements::updateServingCell(const Packet& subpacket) {
  const ServingCellLayout& layout = servingCellLayoutOf(subpacket);
  if (!isPlausible(layout, subpacket)) return;
  for (std::size_t i = 0; const auto cell = measuredCellAt(layout, subpacket, i); ++i) {
    if (cell->servingIndex == 0) return showServingCell(layout, subpacket, cell->bytes);
  }
}

void Measurements::showServingCell(const ServingCellLayout& layout, const Packet& subpacket,
                                   const Packet& cell) {
  beginCell(rawValue(subpacket, layout.channel.source), rawValue(cell, layout.physicalCell));
  sectionRef.show(subpacket, std::span(&layout.channel, 1));
  sectionRef.show(cell, layout.cellFields());
  for (std::size_t i = 0; i < ServingCellLayout::mostAntennas; ++i) {
    const std::span<const Field> unused = unusedAntennas[i];
    if (layout.usesAntenna(cell, i)) {
      sectionRef.show(cell, layout.antenna(i));
      sectionRef.show(cell, unused.subspan(layout.antennaFieldCount));
    } else {
      sectionRef.show(cell, unused);
    }
  }
}

void Measurements::updateIdle(const Packet& payload) {
  constexpr std::uint8_t versionOfShortChannels = 4;
  const std::span<const Field> fields =
      payload.u8(0) == versionOfShortChannels ? std::span<const Field>(idle4) : idle5;
  const std::uint32_t earfcn = rawValue(payload, fields[0].source);
  const std::uint32_t physicalCell = rawValue(payload, fields[1].source);
  if (earfcn > largestEARFCN || physicalCell > largestPhysicalCell) return;
  if (beginCell(earfcn, physicalCell) == Cell::Another) {
    for (const auto& antenna : unusedAntennas) sectionRef.show(payload, antenna);
  }
  sectionRef.show(payload, fields);
}

Measurements::Cell Measurements::beginCell(std::uint32_t earfcn, std::uint32_t physicalCell) {
  if (!showsAnotherNumber(sectionRef, "EARFCN", earfcn) &&
      !showsAnotherNumber(sectionRef, "Physical Cell ID", physicalCell))
    return Cell::Same;
  for (const std::string_view entry : entriesOfSomePackets) sectionRef.setText(entry, "");
  return Cell::Another;
}

void Measurements::listNumberFormats(SectionFormats& formats) const {
  formats.add(idle5);
  listServingCellFormats(formats);
}

}  // namespace varnel::lte
