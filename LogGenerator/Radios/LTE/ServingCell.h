#pragma once

#include <cstdint>
#include <vector>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/Radios/Modem/ReportReader.h"
#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::lte {

/// The cell that the phone is on: its identity, channels, and bandwidths. What is about another cell or
/// channel empties all entries that it does not tell about. So does what does not tell which cell it is
/// about: neither the cell identity that is shown, nor the physical cell and the channel.
class ServingCell final : public VersionedDecoder {
 public:
  ServingCell();
  /// With readers that other decoders use too. They must outlive this one.
  ServingCell(CellMonitorReader& cellMonitor, const modem::ReportReader& modemReports);

  /// The last modem report tells how many digits the network's code has that a cell monitor told.
  void prepareDisplay(const Time& now) override;
  void listNumberFormats(SectionFormats& formats) const override;

 private:
  std::vector<std::uint32_t> otherLogCodes() const override;
  /// A list of the cell monitor. Only its serving LTE cell counts. Of the cell that is shown already, a
  /// number that it lacks, or that is negative, leaves its entry as it is.
  void updateWithOther(const Packet& packet, std::uint32_t logCode) override;

  CellMonitorReader _ownCellMonitor;
  CellMonitorReader& _cellMonitor;
  const modem::ReportReader* _modemReports = nullptr;  // null: there are none
};

}  // namespace varnel::lte
