#pragma once

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The network that the phone is registered on, from the modem or from the telephony server.
class ServingPLMN final : public SectionDecoder<ServingPLMN> {
 public:
  static constexpr std::string_view sectionName = "Serving PLMN";
  static constexpr std::string_view traceLine = "Serving PLMN";
  static const PacketHandlers<ServingPLMN> handlers;

  explicit ServingPLMN(CellMonitorReader& cellMonitor) : _cellMonitor(cellMonitor) {}

 private:
  void updateIdentity(const Packet& packet);
  void updateSelectionMode(const Packet& packet);
  void updateFromCellMonitor(const Packet& packet);

  CellMonitorReader& _cellMonitor;
};

}  // namespace varnel
