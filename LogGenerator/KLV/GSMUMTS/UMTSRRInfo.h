#pragma once

#include <span>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UMTS radio resource control: its state, the serving cell, and the transmit power.
class UMTSRRInfo : public SectionDecoder {
 public:
  explicit UMTSRRInfo(CellMonitorReader& cellMonitor);

  void listNumberFormats(SectionFormats& formats) const override;

 protected:
  /// For a decoder that reads some of the packets in another way. The handlers must live as long as the
  /// program.
  UMTSRRInfo(CellMonitorReader& cellMonitor, std::span<const PacketHandler> handlers);
  static std::span<const PacketHandler> ownHandlers();

 private:
  static const PacketHandler packets[];

  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel
