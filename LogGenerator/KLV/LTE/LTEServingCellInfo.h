#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The LTE serving cell, put together from two modem packets and the telephony server's cell-monitor array. A
/// row keeps its last value until a packet that carries it arrives again.
class LTEServingCellInfo final : public SectionDecoder<LTEServingCellInfo> {
 public:
  static constexpr std::string_view sectionName = "Serving Cell Info";
  static constexpr std::string_view traceLine = "LTE Serving Cell Info";
  static const PacketHandlers<LTEServingCellInfo> handlers;

 private:
  void updateIdentity(const Packet& packet);
  void updateTransmitAntennas(const Packet& packet);
  void updateFromCellMonitor(const Packet& packet);
};

}  // namespace varnel
