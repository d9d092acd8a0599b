#include "LogGenerator/Radios/NR/Cells.h"

#include <optional>
#include <utility>

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Radios/ChannelText.h"
#include "LogGenerator/Radios/NR/Plausible.h"

namespace varnel::nr {

namespace {

/// A field of a record.
struct Entry {
  Source source;
  std::string_view label;
  Format format = integer();
  /// The raw value that stands for none: the record then has no such entry.
  std::optional<std::uint32_t> none{};
};
using Entries = std::span<const Entry>;

constexpr std::size_t extentOf(Entries entries) {
  std::size_t end = 0;
  for (const Entry& entry : entries) end = std::max(end, entry.source.end());
  return end;
}

// A level, in steps of 1/128. It is 0 where the modem measured none.
consteval Entry level(std::uint16_t byte, std::string_view label, const Format& format) {
  return {{byte, 0, 32, true}, label, format, 0};
}
constexpr Format rsrp = real("%.2f dBm", 1.0 / 128);  // 3GPP TS 38.215, 5.1.1
constexpr Format rsrq = real("%.2f dB", 1.0 / 128);   // 3GPP TS 38.215, 5.1.3

constexpr std::uint32_t noCell = 0xFFFF;
consteval Entry physicalCell(std::uint16_t byte, std::string_view label) {
  return {u16(byte), label, integer(), noCell};
}
consteval Entry ssb(std::uint16_t byte) { return {bits(byte, 0, 4), "SSB"}; }

/// A channel. It begins with the channel's number, and its cells follow it.
struct LayerLayout {
  std::size_t size, cellCount, servingIndex;
  Entries entries;
};
constexpr std::size_t servingCell = 6;

constexpr Entry smallLayer[] = {
    physicalCell(servingCell, "Serving Cell"),
    ssb(8),
    level(12, "RSRP Rx0", rsrp),
    level(16, "RSRP Rx1", rsrp),
};
constexpr Entry largeLayer[] = {
    {u8(4), "Carrier"},
    physicalCell(servingCell, "Serving Cell"),
    ssb(9),
    level(12, "RSRP Rx0", rsrp),
    level(16, "RSRP Rx1", rsrp),
    level(20, "RSRP Rx2", rsrp),
    level(24, "RSRP Rx3", rsrp),
};

/// A cell. Its beams follow it.
constexpr std::size_t cellSize = 16, beamCount = 4;
constexpr Entry cell[] = {
    physicalCell(0, "Physical Cell ID"),
    {u16(2), "System Frame Number"},
    level(8, "RSRP", rsrp),
    level(12, "RSRQ", rsrq),
};

struct BeamLayout {
  std::size_t size;
  Entries entries;
};
constexpr Entry smallBeam[] = {
    ssb(0),
    level(20, "RSRP Rx0", rsrp),
    level(24, "RSRP Rx1", rsrp),
    level(28, "Filtered RSRP", rsrp),
    level(32, "Filtered RSRQ", rsrq),
    level(36, "L2 Filtered RSRP", rsrp),
    level(40, "L2 Filtered RSRQ", rsrq),
};
constexpr Entry largeBeam[] = {
    ssb(0),
    level(20, "RSRP Rx0", rsrp),
    level(24, "RSRP Rx1", rsrp),
    level(28, "RSRQ Rx0", rsrq),
    level(32, "RSRQ Rx1", rsrq),
    level(68, "Filtered RSRP", rsrp),
    level(72, "Filtered RSRQ", rsrq),
    level(76, "L2 Filtered RSRP", rsrp),
    level(80, "L2 Filtered RSRQ", rsrq),
};

constexpr LayerLayout layerOf32{32, 4, 5, smallLayer}, layerOf40{40, 5, 8, largeLayer};
constexpr BeamLayout beamOf44{44, smallBeam}, beamOf84{84, largeBeam};
static_assert(extentOf(smallLayer) <= 32 && extentOf(largeLayer) <= 40 && extentOf(cell) <= cellSize &&
              extentOf(smallBeam) == 44 && extentOf(largeBeam) == 84);

void setEntries(Dictionary& record, const Packet& bytes, Entries entries) {
  Formatter formatter;
  for (const Entry& entry : entries) {
    if (entry.none == rawValue(bytes, entry.source)) continue;
    record.setText(entry.label, formatter.text(bytes, entry.source, entry.format));
  }
}

/// Walks over layers, cells and beams, which follow each other without gaps. The walk ends at the first one
/// that does not lie wholly inside the packet.
class Walk {
 public:
  Walk(const Packet& records, const LayerLayout& layer, const BeamLayout& beam)
      : _rest(records), _layer(layer), _beam(beam) {}

  /// A record per layer. Absent when something that no channel or cell has shows that the layout is another
  /// one.
  std::optional<Array> layers(unsigned count) {
    Array layers = records(count, _layer.size, [this](Dictionary& record, const Packet& bytes) {
      const std::uint32_t nrArfcn = bytes.u32(0);
      _isPlausible &= isChannel(nrArfcn) && isPhysicalCellOrNone(bytes.u16(servingCell));
      setInteger(record, "NR-ARFCN", integer(), static_cast<std::int32_t>(nrArfcn));
      record.setText("Frequency", channels::nrFrequency(nrArfcn));
      setEntries(record, bytes, _layer.entries);
      record.set("Cells", Value::ofArray(cells(cellCount(bytes))));
    });
    if (!_isPlausible) return std::nullopt;
    return layers;
  }

 private:
  static bool isPhysicalCellOrNone(std::uint32_t cell) { return isPhysicalCell(cell) || cell == noCell; }

  // Where the count is none, the serving index is the count, if it is one.
  unsigned cellCount(const Packet& layer) const {
    const auto isCount = [](unsigned number) { return number != 0 && number != 255; };
    const unsigned count = layer.u8(_layer.cellCount), servingIndex = layer.u8(_layer.servingIndex);
    return !isCount(count) && isCount(servingIndex) ? servingIndex : count;
  }

  Array cells(unsigned count) {
    return records(count, cellSize, [this](Dictionary& record, const Packet& bytes) {
      _isPlausible &= isPhysicalCellOrNone(bytes.u16(0));
      setEntries(record, bytes, cell);
      record.set("Beams", Value::ofArray(beams(bytes.u8(beamCount))));
    });
  }

  Array beams(unsigned count) {
    return records(count, _beam.size, [this](Dictionary& record, const Packet& bytes) {
      setEntries(record, bytes, _beam.entries);
    });
  }

  // At most so many records of this size. What follows a record is taken while `fill` runs.
  template <class Fill>
  Array records(unsigned count, std::size_t size, Fill fill) {
    Array list;
    for (; count > 0 && _rest.holds(0, size); --count) {
      const Packet bytes(_rest.bytes().first(size));
      _rest = _rest.from(size);
      Value record = Value::ofDictionary();
      fill(*record.dictionary(), bytes);
      list.push_back(std::move(record));
    }
    // What is left is a part of a record. A smaller one must not be read from it.
    if (count > 0) _rest = Packet({});
    return list;
  }

  Packet _rest;
  const LayerLayout& _layer;
  const BeamLayout& _beam;
  bool _isPlausible = true;
};

// Behind the number of layers.
constexpr Field database[] = {
    {u8(1), "SSB Period"},
};

template <std::size_t countOffset, std::size_t firstLayer, const LayerLayout& layer, const BeamLayout& beam>
void update(Section& section, const Packet& payload) {
  auto layers = Walk(payload.from(firstLayer), layer, beam).layers(payload.u8(countOffset));
  if (!layers) return;
  section.show(payload.from(countOffset), database);
  section.set("Layers", Value::ofArray(*std::move(layers)));
}

constexpr PacketLayout layouts[] = {
    {0xB97F, 0x20006, 8, update<4, 8, layerOf32, beamOf44>},
    {0xB97F, 0x20007, 16, update<4, 16, layerOf32, beamOf44>},
    {0xB97F, 0x20009, 20, update<8, 20, layerOf32, beamOf44>},
    {0xB97F, 0x2000A, 20, update<8, 20, layerOf32, beamOf84>},
    {0xB97F, 0x30000, 20, update<8, 20, layerOf40, beamOf84>},
};

}  // namespace

Cells::Cells() : VersionedDecoder("Cells", layouts) {}

void Cells::listNumberFormats(SectionFormats& formats) const {
  formats.add("NR-ARFCN", integer());
  formats.add("Frequency", channels::nrFrequencyFormat);
  formats.add(largeLayer);
  formats.add(cell);
  formats.add(largeBeam);
}

}  // namespace varnel::nr
