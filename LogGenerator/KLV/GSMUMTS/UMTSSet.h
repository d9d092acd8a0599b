#pragma once

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The ranked UMTS cells or, from the telephony server, the neighbours: a row each.
class UMTSSet final : public SectionDecoder<UMTSSet> {
 public:
  static constexpr std::string_view sectionName = "UMTS Set";
  static constexpr std::string_view traceLine = "UMTSSet";
  static const PacketHandlers<UMTSSet> handlers;

  explicit UMTSSet(CellMonitorReader& cellMonitor) : _cellMonitor(cellMonitor) {}

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void updateFromRanking(const Packet& packet);
  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel
