#pragma once

#include <cstdint>
#include <vector>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::lte {

/// The cell that the phone is on: its identity, channels, and bandwidths. A packet about another cell or
/// channel empties all entries that it does not tell about.
class ServingCell final : public VersionedDecoder {
 public:
  ServingCell();
  /// With a reader of cell-monitor packets that other decoders use too.
  explicit ServingCell(CellMonitorReader& cellMonitor);

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  std::vector<std::uint32_t> otherLogCodes() const override;
  /// A list of the cell monitor. Only its serving LTE cell counts. A number that it lacks, or that is
  /// negative, leaves its entry as it is.
  void updateWithOther(const Packet& packet, std::uint32_t logCode) override;

  CellMonitorReader _ownCellMonitor;
  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel::lte
