#pragma once

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UTRAN serving cell, from the modem's packets and the telephony server's cell-monitor array.
class UTRANServingCellInfo final : public SectionDecoder {
 public:
  UTRANServingCellInfo() : UTRANServingCellInfo(nullptr) {}
  /// With a reader that decoders of other indexes use too.
  explicit UTRANServingCellInfo(CellMonitorReader& cellMonitor) : UTRANServingCellInfo(&cellMonitor) {}

 private:
  static const PacketHandler packets[];

  explicit UTRANServingCellInfo(CellMonitorReader* cellMonitor);
  void showCellMonitor(const Packet& packet);

  CellMonitorReader* const _cellMonitor;  // null: the packets are parsed for this decoder alone
};

}  // namespace varnel
