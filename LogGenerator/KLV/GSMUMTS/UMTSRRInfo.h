#pragma once

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UMTS radio resource control: its state, the serving cell and the transmit power.
class UMTSRRInfo final : public SectionDecoder<UMTSRRInfo> {
 public:
  static constexpr std::string_view sectionName = "UMTS RR Info";
  static constexpr std::string_view traceLine = "UMTSRRInfo";
  static const PacketHandlers<UMTSRRInfo> handlers;

  explicit UMTSRRInfo(CellMonitorReader& cellMonitor) : _cellMonitor(cellMonitor) {}

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void updateState(const Packet& packet);
  void updateTransmitPower(const Packet& packet);
  void updateServingCell(const Packet& packet);
  void updateCiphering(const Packet& packet);
  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel
