#pragma once

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The network on which the phone is registered, from the modem or from the telephony server.
class ServingPLMN final : public SectionDecoder {
 public:
  explicit ServingPLMN(CellMonitorReader& cellMonitor);

 private:
  static const PacketHandler packets[];

  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel
