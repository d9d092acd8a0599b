#pragma once

#include <cstdint>
#include <unordered_map>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GSM neighbor cells, from the modem or from the telephony server, one record per cell.
class NeighboringCells final : public SectionDecoder {
 public:
  explicit NeighboringCells(CellMonitorReader& cellMonitor);

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  static const PacketHandler packets[];

  void updateMeasurements(const Packet& packet);
  void updateIdentityCodes(const Packet& packet);
  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
  /// Channel → base station identity code, from the last packet with identity codes.
  std::unordered_map<std::uint16_t, std::uint8_t> arfcnToBsic;
};

}  // namespace varnel
