#include "LogGenerator/Radios/LTE/Neighbors.h"

#include <array>
#include <cmath>
#include <limits>
#include <optional>
#include <utility>

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Radios/RecordWriter.h"
#include "LogGenerator/Radios/ShownNumber.h"
#include "platform/TelephonyService.h"

namespace varnel::lte {

namespace {

constexpr std::string_view channelEntry = "EARFCN", cellEntry = "Physical Cell ID", levelEntry = "RSRP";
constexpr std::string_view frequencyEntry = "Downlink Frequency";

// Whole decibels.
constexpr Format cellMonitorLevel = integer("%d dBm");
constexpr std::int32_t unknownLevel = 32767;

// The rank of a cell whose level nobody tells.
constexpr double last = std::numeric_limits<double>::infinity();

std::uint64_t keyOf(std::uint32_t earfcn, std::uint32_t physicalCell) {
  constexpr unsigned physicalCellBits = 9;
  return std::uint64_t{earfcn} << physicalCellBits | physicalCell;
}

// The strongest first.
double rankOf(const Packet& cell, const Field& level) {
  const std::uint32_t raw = rawValue(cell, level.source);
  const double number = level.source.isSigned ? static_cast<std::int32_t>(raw) : static_cast<double>(raw);
  return -(number * level.format.realFactor + level.format.realSummand);
}

std::optional<CellPlace> placeOf(const Dictionary& record) {
  const auto earfcn = shownNumber<std::uint32_t>(record.get(channelEntry));
  const auto physicalCell = shownNumber<std::uint32_t>(record.get(cellEntry));
  if (!earfcn || !physicalCell || *physicalCell > largestPhysicalCell) return std::nullopt;
  const auto level = shownNumber<double>(record.get(levelEntry));
  return CellPlace{level && std::isfinite(*level) ? -*level : last, keyOf(*earfcn, *physicalCell)};
}

// Calls `take(cell)` for each neighbor whose fields lie wholly in the body.
template <class Take>
void forEachNeighbor(const NeighborLayout& layout, const Packet& body, Take take) {
  const std::size_t count = rawValue(body, layout.count);
  for (std::size_t i = 0; i < count && body.holds(layout.first + layout.stride * i, layout.cellSize); ++i)
    take(body.from(layout.first + layout.stride * i));
}

bool isPlausible(const NeighborLayout& layout, const Packet& body) {
  if (rawValue(body, layout.channel) > largestEARFCN) return false;
  if (layout.ownCell.width > 0 && rawValue(body, layout.ownCell) > largestPhysicalCell) return false;
  bool areCells = true;
  forEachNeighbor(layout, body, [&](const Packet& cell) {
    areCells = areCells && rawValue(cell, layout.physicalCell) <= largestPhysicalCell;
  });
  return areCells;
}

}  // namespace

struct Neighbors::Packets {
  template <std::size_t... index>
  static consteval auto ofLayouts(std::index_sequence<index...>) {
    return std::array{
        PacketLayout(neighborLayouts[index].logCode, neighborLayouts[index].version,
                     neighborLayouts[index].minimumSize, calling<&Neighbors::updateFrom<index>>)
            .inSubpacket(neighborLayouts[index].subpacket, neighborLayouts[index].subpacketVersion)...};
  }

  static constexpr std::size_t layouts = std::size(neighborLayouts);
  static const std::array<PacketLayout, servingCellVersions + layouts> all;
};

constinit const std::array<PacketLayout, servingCellVersions + Neighbors::Packets::layouts>
    Neighbors::Packets::all =
        servingCellPacketsAnd(calling<&Neighbors::updateFromServingCells>,
                              Packets::ofLayouts(std::make_index_sequence<Packets::layouts>()));

Neighbors::Neighbors()
    : VersionedDecoder("Neighbors", Packets::all), _cellMonitor(_ownCellMonitor), _cells(placeOf) {}

Neighbors::Neighbors(CellMonitorReader& cellMonitor)
    : VersionedDecoder("Neighbors", Packets::all), _cellMonitor(cellMonitor), _cells(placeOf) {}

std::vector<std::uint32_t> Neighbors::otherLogCodes() const { return {cellMonitorLogCode}; }

void Neighbors::listNumberFormats(SectionFormats& formats) const {
  formats.add(idleLevels);
  formats.add(frequencyEntry, channels::frequencyFormat);
}

void Neighbors::prepareDisplay(const Time& now) {
  _cells.begin(sectionRef, now);
  _cells.show(sectionRef);
}

template <class AddAll>
void Neighbors::showAfter(AddAll addAll) {
  _cells.begin(sectionRef, sectionRef.time());
  addAll();
  _cells.show(sectionRef);
}

template <class PutLevels>
void Neighbors::addRecord(double rank, std::uint32_t physicalCell, std::string_view source,
                          PutLevels putLevels) {
  Dictionary* const record = _cells.see({rank, keyOf(_channel.earfcn(), physicalCell)});
  if (!record) return;
  RecordWriter writer(*record);
  writer.put(channelEntry, _channel.number());
  writer.put(cellEntry, physicalCell);
  writer.putUnlessEmpty("Band", _channel.band());
  writer.putUnlessEmpty(frequencyEntry, _channel.frequency());
  putLevels(writer);
  writer.put(SeenCells::lastSeenEntry, _cells.lastSeen());
  writer.put("Source", source);
}

void Neighbors::add(std::uint32_t physicalCell, const Packet& cell, std::span<const Field> levels,
                    std::string_view source) {
  addRecord(rankOf(cell, levels.front()), physicalCell, source,
            [&](RecordWriter& writer) { writer.put(cell, levels); });
}

void Neighbors::updateFromServingCells(const Packet& subpacket) {
  const ServingCellLayout& layout = servingCellLayoutOf(subpacket);
  if (!isPlausible(layout, subpacket)) return;
  constexpr std::uint8_t primary = 0;
  showAfter([&] {
    _channel.setChannel(rawValue(subpacket, layout.channel.source));
    forEachMeasuredCell(layout, subpacket, [&](const MeasuredCell& cell) {
      if (cell.servingIndex == primary) {
        // After a handover, the cell is a neighbor no more.
        _cells.remove(keyOf(_channel.earfcn(), cell.physicalCell));
      } else if (!cell.servingIndex && layout.tellsServing()) {
        add(cell.physicalCell, cell.bytes, layout.levels(), "0xB193");
      }
    });
  });
}

void Neighbors::update(const NeighborLayout& layout, const Packet& body) {
  if (!isPlausible(layout, body)) return;
  showAfter([&] {
    _channel.setChannel(rawValue(body, layout.channel));
    forEachNeighbor(layout, body, [&](const Packet& cell) {
      add(rawValue(cell, layout.physicalCell), cell, layout.levels, layout.source);
    });
  });
}

void Neighbors::updateWithOther(const Packet& packet, std::uint32_t /*logCode*/) {
  const Array* const cells = _cellMonitor.read(packet);
  if (!cells) return;
  showAfter([&] {
    for (const Value& record : *cells) {
      const Dictionary* const cell = cellOfKind(record, cellMonitor::lte, cellMonitor::neighbor);
      if (cell) addFromCellMonitor(*cell);
    }
  });
}

// Leaves out a cell without a channel or an identity of LTE.
void Neighbors::addFromCellMonitor(const Dictionary& cell) {
  const auto earfcn = cell.get(cellMonitor::uarfcn).int32();
  const auto physicalCell = cell.get(cellMonitor::physicalCellIdentity).int32();
  if (!earfcn || !physicalCell || *earfcn < 0 || *physicalCell < 0) return;
  const auto channel = static_cast<std::uint32_t>(*earfcn), code = static_cast<std::uint32_t>(*physicalCell);
  if (channel > largestEARFCN || code > largestPhysicalCell) return;
  _channel.setChannel(channel);
  addRecord(last, code, "Cell Monitor", [&](RecordWriter& writer) {
    const auto level_dbm = cell.get(cellMonitor::rssi).int32();
    if (level_dbm && *level_dbm != unknownLevel) writer.put("RSSI", cellMonitorLevel, *level_dbm);
  });
}

}  // namespace varnel::lte
