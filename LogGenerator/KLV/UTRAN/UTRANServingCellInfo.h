#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UTRAN serving cell, put together from the modem's packets and the telephony server's cell-monitor
/// array.
class UTRANServingCellInfo final : public SectionDecoder<UTRANServingCellInfo> {
 public:
  static constexpr std::string_view sectionName = "Serving Cell Info";
  static constexpr std::string_view traceLine = "Serving Cell Info";
  static constexpr UnknownCodes unknownCodes = UnknownCodes::Ignored;
  static const PacketHandlers<UTRANServingCellInfo> handlers;

 private:
  void updateFromModem(const Packet& packet);
  void updateFromCellMonitor(const Packet& packet);
};

}  // namespace varnel
