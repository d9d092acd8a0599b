#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GSM radio resource management.
class GSMRRInfo final : public SectionDecoder<GSMRRInfo> {
 public:
  static constexpr std::string_view sectionName = "GSM RR Info";
  static constexpr std::string_view traceLine = "GSMRRInfo";
  static const PacketHandlers<GSMRRInfo> handlers;

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void updateState(const Packet& packet);
  void updateMeasurement(const Packet& packet);
  void updateTransmission(const Packet& packet);
  void updateReception(const Packet& packet);
};

}  // namespace varnel
