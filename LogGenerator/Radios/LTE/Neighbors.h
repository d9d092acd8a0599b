#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/Radios/LTE/ChannelEntries.h"
#include "LogGenerator/Radios/LTE/NeighborLayouts.h"
#include "LogGenerator/Radios/SeenCells.h"
#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::lte {

/// The cells around the serving cell, from every packet that lists them: a record per channel and cell, the
/// strongest first. The levels of a record are those of the packet that it names as its source. A cell that
/// becomes the primary serving cell leaves the list.
class Neighbors final : public VersionedDecoder {
 public:
  Neighbors();
  /// With a reader of cell-monitor packets that other decoders use too.
  explicit Neighbors(CellMonitorReader& cellMonitor);

  void prepareDisplay(const Time& now) override;
  void listNumberFormats(SectionFormats& formats) const override;

 private:
  struct Packets;

  std::vector<std::uint32_t> otherLogCodes() const override;
  void updateWithOther(const Packet& packet, std::uint32_t logCode) override;
  void updateFromServingCells(const Packet& subpacket);
  template <std::size_t layout>
  void updateFrom(const Packet& body) {
    update(neighborLayouts[layout], body);
  }
  void update(const NeighborLayout& layout, const Packet& body);
  void addFromCellMonitor(const Dictionary& cell);

  /// Calls `addAll()`, which adds cells, at the section's time, and shows the list.
  template <class AddAll>
  void showAfter(AddAll addAll);
  void add(std::uint32_t physicalCell, const Packet& cell, std::span<const Field> levels,
           std::string_view source);
  /// Adds a cell of the channel that was set last. `putLevels(RecordWriter&)` writes its levels.
  template <class PutLevels>
  void addRecord(double rank, std::uint32_t physicalCell, std::string_view source, PutLevels putLevels);

  CellMonitorReader _ownCellMonitor;
  CellMonitorReader& _cellMonitor;
  SeenCells _cells;
  ChannelEntries _channel;
};

}  // namespace varnel::lte
