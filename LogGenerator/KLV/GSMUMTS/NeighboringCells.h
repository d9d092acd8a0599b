#pragma once

#include <cstdint>
#include <unordered_map>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GSM neighbour cells, from the modem or from the telephony server: a row each.
class NeighboringCells final : public SectionDecoder<NeighboringCells> {
 public:
  static constexpr std::string_view sectionName = "Neighboring Cells";
  static constexpr std::string_view traceLine = "NeighboringCells";
  static const PacketHandlers<NeighboringCells> handlers;

  explicit NeighboringCells(CellMonitorReader& cellMonitor) : _cellMonitor(cellMonitor) {}

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void updateMeasurements(const Packet& packet);
  void updateIdentityCodes(const Packet& packet);
  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
  /// Channel → base station identity code, as last heard.
  std::unordered_map<std::uint16_t, std::uint8_t> arfcnToBsic;
};

}  // namespace varnel
