#include "LogGenerator/Radios/LTE/ServingCellLayouts.h"

#include <algorithm>
#include <string_view>

#include "LogGenerator/NumberFormats.h"

namespace varnel::lte {

namespace {

// A field that a version does not have.
constexpr std::uint16_t none = 0xFFFF;

constexpr Format snrFormat = real("%.1f dB", 0.1, -20.0);
// The level of all antennas together has a zero of its own where four antennas are measured.
constexpr Format togetherFormat = real("%.2f dBm", 1.0 / 16, -140.0);
constexpr Format sirFormat = real("%.2f dB", 1.0 / 16);

// The versions for two antennas. All numbers but the first three are offsets of words of four bytes, or of
// two for the cell and the frame. They count from the cell's first byte, those of versions 4 and 7 from the
// subpacket's. In a word, the values of all these versions have the same bits, but for the RSRQ of both
// antennas together, whose first bit stands behind its offset.
struct TwoAntennas {
  std::uint8_t version;
  std::uint16_t first, stride;  // a stride of 0: there is one cell
  std::uint16_t cell, frame;
  std::uint16_t rsrp0, rsrp1, rsrp;
  std::uint16_t rsrq0, rsrq1, rsrq;
  std::uint8_t rsrqBit;
  std::uint16_t rssi01, rssi;
  std::uint16_t snr01;
  std::uint16_t sir, rsrqAfter;
};

// clang-format off
constexpr TwoAntennas forTwoAntennas[] = {
    // Vers First Stride Cell Frame  RSRP Rx0 Rx1 all  RSRQ Rx0 Rx1 all, bit  RSSI 01 all  SNR 01  SIR   RSRQ after
    {  4,     0,     0,   6,   8,         16, 20, 24,       28, 32, 32, 20,        36, 40,    64,  none, none},
    {  7,     0,     0,   8,  12,         20, 24, 28,       32, 36, 36, 20,        40, 44,    68,  none, none},
    { 18,     8,     0,   0,   4,         16, 20, 24,       28, 32, 32, 20,        36, 40,    64,  none, none},
    { 19,    12,    88,   0,   4,         16, 20, 24,       28, 32, 32, 20,        36, 40,    64,    80,   84},
    { 22,    12,   112,   0,   4,         16, 20, 28,       32, 36, 40, 10,        44, 52,    76,    96,  100},
    { 24,    12,    92,   0,   4,         16, 20, 24,       28, 32, 32, 20,        36, 40,    64,    80,   84},
};
// clang-format on

// The versions for four antennas, in the same way. The RSRP of all antennas together shares the word of
// antenna 3. The filtered RSRQ is in the word of the RSRQ of all antennas.
struct FourAntennas {
  std::uint8_t version;
  std::uint16_t first, stride;
  std::uint16_t cell, frame;
  std::uint16_t rsrp0, rsrp1, rsrp2, rsrp3, filtered;
  std::uint16_t rsrq01, rsrq23, rsrq;
  std::uint16_t rssi01, rssi23, rssi;
  std::uint16_t snr01, snr23;
  std::uint16_t sir, rsrqAfter;
};

// clang-format off
constexpr FourAntennas forFourAntennas[] = {
    // Vers First Stride Cell Frame  RSRP Rx0 Rx1 Rx2 Rx3 filtered  RSRQ 01 23 all  RSSI 01 23 all  SNR 01 23     SIR  RSRQ after
    { 35,    12,   124,   0,   4,         16, 20, 24, 28, 32,            36, 40, 44,     48, 52, 56,   80,   84,  100,  104},
    { 36,    12,   128,   0,   4,         16, 20, 24, 28, 32,            36, 40, 44,     48, 52, 56,   80,   84,  104,  108},
    { 40,    12,   132,   0,   4,         16, 20, 24, 32, 36,            40, 44, 48,     52, 56, 60,   84,   88,  108,  112},
    { 48,    16,   140,   0,   4,         16, 20, 24, 32, 36,            40, 44, 48,     52, 56, 60,   92,   96,  116,  120},
    { 50,    16,   140,   0,   4,         16, 20, 24, 32, 36,            40, 44, 48,     52, 56, 60,   92,   96,  116,  120},
    // The cells of this version do not tell whether they serve, and where their SNR is, is not known.
    { 60,    12,   148,   8,  12,         24, 28, 32, 40, 44,            48, 52, 56,     60, 64, 68, none, none,  140,  144},
};
// clang-format on

constexpr std::uint8_t versionWithoutServingBits = 60;

// A run of bits of a word; the first bit may lie behind the word's first byte.
consteval Source inWord(std::uint16_t word, unsigned firstBit, std::uint8_t width) {
  return bits(static_cast<std::uint16_t>(word + firstBit / 8), static_cast<std::uint8_t>(firstBit % 8),
              width);
}

// Collects the fields of a layout.
class Builder {
 public:
  template <class Row>
  consteval explicit Builder(const Row& row) {
    // The oldest version alone has channel numbers of two bytes, the newest alone a count of four.
    _layout.version = row.version;
    _layout.channel = {row.version == 4 ? u16(4) : u32(4), "EARFCN"};
    if (row.stride > 0) _layout.count = row.version == versionWithoutServingBits ? u32(8) : u16(8);
    _layout.first = row.first;
    _layout.stride = row.stride;
    _layout.physicalCell = inWord(row.cell, 0, 9);
    if (row.version != versionWithoutServingBits) {
      _layout.servingIndex = inWord(row.cell, 9, 3);
      _layout.isServing = inWord(row.cell, 12, 1);
    }
    add({_layout.physicalCell, "Physical Cell ID"});
  }

  consteval void add(const Field& field) {
    _layout.fields[_layout.fieldCount++] = field;
    include(field.source);
  }
  consteval void addLevels(Source rsrp, const Format& format, Source rsrq, Source rssi) {
    add({rsrp, "RSRP", format});
    add({rsrq, "RSRQ", rsrqFormat});
    add({rssi, "RSSI", rssiFormat});
  }
  consteval void addFrame(std::uint16_t word) {
    add({inWord(word, 0, 10), "System Frame Number"});
    add({inWord(word, 10, 4), "Subframe"});
  }
  consteval void addCancellation(std::uint16_t sir, std::uint16_t rsrqAfter) {
    if (sir == none) return;
    add({{sir, 0, 32, true}, "Projected SIR", sirFormat});
    add({u32(rsrqAfter), "RSRQ after Cancellation", rsrqFormat});
  }
  consteval void addAntenna(Source rsrp, Source rsrq, Source rssi) {
    const std::size_t index = _layout.antennaCount++;
    addOfAntenna(index, 0, rsrp, rsrpFormat);
    addOfAntenna(index, 1, rsrq, rsrqFormat);
    addOfAntenna(index, 2, rssi, rssiFormat);
  }
  // Two antennas share a word.
  consteval void addSNR(std::size_t firstAntenna, std::uint16_t word) {
    if (word == none) return;
    addOfAntenna(firstAntenna, 3, inWord(word, 0, 9), snrFormat);
    addOfAntenna(firstAntenna + 1, 3, inWord(word, 9, 9), snrFormat);
  }

  consteval ServingCellLayout layout() const {
    ServingCellLayout layout = _layout;
    layout.minimumSize = layout.stride > 0 ? layout.first : layout.first + layout.cellSize;
    return layout;
  }

 private:
  consteval void addOfAntenna(std::size_t antenna, std::size_t quantity, Source source,
                              const Format& format) {
    _layout.antennas[antenna][quantity] = {source, antennaLabels[antenna][quantity], format};
    _layout.antennaFieldCount = std::max(_layout.antennaFieldCount, quantity + 1);
    include(source);
  }
  // A word is wholly there or not at all.
  consteval void include(const Source& source) {
    constexpr std::size_t wordSize = 4;
    const std::size_t end = (source.end() + wordSize - 1) / wordSize * wordSize;
    _layout.cellSize = std::max(_layout.cellSize, end);
  }

  ServingCellLayout _layout{};
};

consteval ServingCellLayout layoutOf(const TwoAntennas& row) {
  Builder builder(row);
  builder.addLevels(inWord(row.rsrp, 12, 12), rsrpFormat, inWord(row.rsrq, row.rsrqBit, 10),
                    inWord(row.rssi, 0, 11));
  builder.addFrame(row.frame);
  builder.addCancellation(row.sir, row.rsrqAfter);
  builder.addAntenna(inWord(row.rsrp0, 10, 12), inWord(row.rsrq0, 12, 10), inWord(row.rssi01, 10, 11));
  builder.addAntenna(inWord(row.rsrp1, 12, 12), inWord(row.rsrq1, 0, 10), inWord(row.rssi01, 21, 11));
  builder.addSNR(0, row.snr01);
  return builder.layout();
}

consteval ServingCellLayout layoutOf(const FourAntennas& row) {
  Builder builder(row);
  builder.addLevels(inWord(row.rsrp3, 12, 12), togetherFormat, inWord(row.rsrq, 0, 10),
                    inWord(row.rssi, 0, 11));
  builder.addFrame(row.frame);
  builder.add({inWord(row.filtered, 12, 12), "Filtered RSRP", rsrpFormat});
  builder.add({inWord(row.rsrq, 20, 10), "Filtered RSRQ", rsrqFormat});
  builder.addCancellation(row.sir, row.rsrqAfter);
  builder.addAntenna(inWord(row.rsrp0, 10, 12), inWord(row.rsrq01, 0, 10), inWord(row.rssi01, 0, 11));
  builder.addAntenna(inWord(row.rsrp1, 12, 12), inWord(row.rsrq01, 20, 10), inWord(row.rssi01, 11, 11));
  builder.addAntenna(inWord(row.rsrp2, 12, 12), inWord(row.rsrq23, 10, 10), inWord(row.rssi23, 0, 11));
  builder.addAntenna(inWord(row.rsrp3, 0, 12), inWord(row.rsrq23, 20, 10), inWord(row.rssi23, 11, 11));
  builder.addSNR(0, row.snr01);
  builder.addSNR(2, row.snr23);
  return builder.layout();
}

constexpr std::size_t twos = std::size(forTwoAntennas), fours = std::size(forFourAntennas);

consteval auto allLayouts() {
  std::array<ServingCellLayout, twos + fours> layouts{};
  auto next = layouts.begin();
  for (const TwoAntennas& row : forTwoAntennas) *next++ = layoutOf(row);
  for (const FourAntennas& row : forFourAntennas) *next++ = layoutOf(row);
  return layouts;
}

constexpr std::array layouts = allLayouts();

static_assert(std::ranges::equal(layouts, servingCell::minimums,
                                 [](const ServingCellLayout& layout, const servingCell::Minimum& minimum) {
                                   return layout.version == minimum.version &&
                                          layout.minimumSize == minimum.size;
                                 }),
              "the decoders list other versions or sizes than these tables");

}  // namespace

bool ServingCellLayout::usesAntenna(const Packet& cell, std::size_t index) const {
  return index < antennaCount && std::ranges::any_of(antenna(index), [&](const Field& field) {
           return rawValue(cell, field.source) != 0;
         });
}

const ServingCellLayout& servingCellLayoutOf(const Packet& subpacket) {
  constexpr std::size_t versionOffset = 1;
  const auto found = std::ranges::find(layouts, subpacket.u8(versionOffset), &ServingCellLayout::version);
  return found == layouts.end() ? layouts.back() : *found;
}

bool isPlausible(const ServingCellLayout& layout, const Packet& subpacket) {
  if (rawValue(subpacket, layout.channel.source) > largestEARFCN) return false;
  bool areCells = true;
  forEachMeasuredCell(layout, subpacket, [&](const MeasuredCell& cell) {
    areCells = areCells && cell.physicalCell <= largestPhysicalCell;
  });
  return areCells;
}

std::optional<MeasuredCell> measuredCellAt(const ServingCellLayout& layout, const Packet& subpacket,
                                           std::size_t index) {
  const std::size_t count = layout.count.width == 0 ? 1 : rawValue(subpacket, layout.count);
  const std::size_t offset = layout.first + layout.stride * index;
  if (index >= count || !subpacket.holds(offset, layout.cellSize)) return std::nullopt;
  MeasuredCell cell{.bytes = subpacket.from(offset), .physicalCell = 0, .servingIndex = std::nullopt};
  cell.physicalCell = static_cast<std::uint16_t>(rawValue(cell.bytes, layout.physicalCell));
  if (!layout.tellsServing()) {
    if (index == 0) cell.servingIndex = 0;
  } else if (rawValue(cell.bytes, layout.isServing) != 0) {
    cell.servingIndex = static_cast<std::uint8_t>(rawValue(cell.bytes, layout.servingIndex));
  }
  return cell;
}

void listServingCellFormats(SectionFormats& formats) {
  // The texts around a number are the same in all versions. This version has all entries.
  constexpr std::uint8_t versionWithAll = 36;
  constexpr auto layout = std::ranges::find(layouts, versionWithAll, &ServingCellLayout::version);
  formats.add(layout->cellFields());
  for (std::size_t i = 0; i < layout->antennaCount; ++i) formats.add(layout->antenna(i));
}

}  // namespace varnel::lte
