#include "LogGenerator/Radios/LTE/Carriers.h"

#include <algorithm>
#include <iterator>
#include <optional>
#include <string_view>

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Radios/RecordWriter.h"

namespace varnel::lte {

namespace {

constexpr std::string_view carrierEntry = "Carrier", frequencyEntry = "Downlink Frequency";

// By serving index, which has three bits.
constexpr std::string_view names[] = {"Primary",     "Secondary 1", "Secondary 2", "Secondary 3",
                                      "Secondary 4", "Secondary 5", "Secondary 6", "Secondary 7"};

CellPlace placeOfIndex(std::size_t servingIndex) { return {.rank = 0, .key = servingIndex}; }

std::optional<CellPlace> placeOf(const Dictionary& record) {
  const std::string* const name = record.get(carrierEntry).string();
  const auto found = name ? std::ranges::find(names, *name) : std::end(names);
  if (found == std::end(names)) return std::nullopt;
  return placeOfIndex(static_cast<std::size_t>(found - std::begin(names)));
}

// All values of a kind, then those of the next kind.
void putAntennas(RecordWriter& writer, const ServingCellLayout& layout, const Packet& cell) {
  std::array<bool, ServingCellLayout::mostAntennas> isUsed{};
  for (std::size_t i = 0; i < isUsed.size(); ++i) isUsed[i] = layout.usesAntenna(cell, i);
  for (std::size_t kind = 0; kind < layout.antennaFieldCount; ++kind) {
    for (std::size_t i = 0; i < isUsed.size(); ++i) {
      if (isUsed[i]) writer.put(cell, layout.antennas[i][kind]);
    }
  }
}

}  // namespace

constinit const std::array<PacketLayout, servingCellVersions> Carriers::packets =
    servingCellPacketsAnd(calling<&Carriers::update>);

Carriers::Carriers() : VersionedDecoder("Carriers", packets), _cells(placeOf) {}

void Carriers::listNumberFormats(SectionFormats& formats) const {
  listServingCellFormats(formats);
  formats.add(frequencyEntry, channels::frequencyFormat);
}

void Carriers::prepareDisplay(const Time& now) {
  _cells.begin(sectionRef, now);
  _cells.show(sectionRef);
}

void Carriers::update(const Packet& subpacket) {
  const ServingCellLayout& layout = servingCellLayoutOf(subpacket);
  if (!isPlausible(layout, subpacket)) return;
  _cells.begin(sectionRef, sectionRef.time());
  _channel.setChannel(rawValue(subpacket, layout.channel.source));
  forEachMeasuredCell(layout, subpacket, [&](const MeasuredCell& cell) {
    if (cell.servingIndex) add(layout, cell, *cell.servingIndex);
  });
  _cells.show(sectionRef);
}

void Carriers::add(const ServingCellLayout& layout, const MeasuredCell& cell, std::uint8_t servingIndex) {
  Dictionary* const record = _cells.see(placeOfIndex(servingIndex));
  if (!record) return;
  RecordWriter writer(*record);
  writer.put(carrierEntry, names[servingIndex]);
  writer.put("EARFCN", _channel.number());
  writer.putUnlessEmpty("Band", _channel.band());
  writer.putUnlessEmpty(frequencyEntry, _channel.frequency());
  writer.put("Physical Cell ID", cell.physicalCell);
  writer.put(cell.bytes, layout.levels());
  putAntennas(writer, layout, cell.bytes);
  writer.put(SeenCells::lastSeenEntry, _cells.lastSeen());
}

}  // namespace varnel::lte
