#pragma once

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GSM serving cell, from the modem or from the telephony server.
class GSMServingCell final : public SectionDecoder<GSMServingCell> {
 public:
  static constexpr std::string_view sectionName = "GSM Serving Cell";
  static constexpr std::string_view traceLine = "GSMServingCell";
  static const PacketHandlers<GSMServingCell> handlers;

  explicit GSMServingCell(CellMonitorReader& cellMonitor) : _cellMonitor(cellMonitor) {}

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void updateIdentity(const Packet& packet);
  void updateMeasurement(const Packet& packet);
  void updateDedicatedChannel(const Packet& packet);
  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel
