#pragma once

#include <span>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GSM serving cell, from the modem or from the telephony server.
class GSMServingCell : public SectionDecoder {
 public:
  explicit GSMServingCell(CellMonitorReader& cellMonitor);

 protected:
  /// For a decoder that reads some of the packets in another way. The handlers must live as long as the
  /// program.
  GSMServingCell(CellMonitorReader& cellMonitor, std::span<const PacketHandler> handlers);
  static std::span<const PacketHandler> ownHandlers();

 private:
  static const PacketHandler packets[];

  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel
