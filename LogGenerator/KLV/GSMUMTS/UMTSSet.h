#pragma once

#include <span>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The ranked UMTS cells, or the neighbors from the telephony server, one record per cell.
class UMTSSet : public SectionDecoder {
 public:
  explicit UMTSSet(CellMonitorReader& cellMonitor);

  void listNumberFormats(SectionFormats& formats) const override;

 protected:
  /// For a decoder that reads some of the packets in another way. The handlers must live as long as the
  /// program.
  UMTSSet(CellMonitorReader& cellMonitor, std::span<const PacketHandler> handlers);
  static std::span<const PacketHandler> ownHandlers();

 private:
  static const PacketHandler packets[];

  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel
