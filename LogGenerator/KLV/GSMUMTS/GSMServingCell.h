#pragma once

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GSM serving cell, from the modem or from the telephony server.
class GSMServingCell final : public SectionDecoder {
 public:
  explicit GSMServingCell(CellMonitorReader& cellMonitor);

 private:
  static const PacketHandler packets[];

  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel
