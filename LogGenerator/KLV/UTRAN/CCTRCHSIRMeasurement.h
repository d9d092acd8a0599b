#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The signal-to-interference ratios of the coded composite transport channels, a row each.
class CCTRCHSIRMeasurement final : public SectionDecoder<CCTRCHSIRMeasurement> {
 public:
  static constexpr std::string_view sectionName = "CCTRCH SIR";
  static constexpr std::string_view traceLine = "CCTRCH SIR Measurement";
  static constexpr UnknownCodes unknownCodes = UnknownCodes::Ignored;
  static const PacketHandlers<CCTRCHSIRMeasurement> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel
