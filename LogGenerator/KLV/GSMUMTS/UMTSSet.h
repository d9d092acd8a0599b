#pragma once

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The ranked UMTS cells, or the neighbors from the telephony server, one record per cell.
class UMTSSet final : public SectionDecoder {
 public:
  explicit UMTSSet(CellMonitorReader& cellMonitor);

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  static const PacketHandler packets[];

  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel
