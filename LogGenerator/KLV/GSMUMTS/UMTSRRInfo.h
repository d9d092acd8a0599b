#pragma once

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UMTS radio resource control: its state, the serving cell, and the transmit power.
class UMTSRRInfo final : public SectionDecoder {
 public:
  explicit UMTSRRInfo(CellMonitorReader& cellMonitor);

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  static const PacketHandler packets[];

  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel
