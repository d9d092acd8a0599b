#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// What the GSM cell says of its packet service.
class GPRSInformation final : public SectionDecoder<GPRSInformation> {
 public:
  static constexpr std::string_view sectionName = "GPRS Information";
  static constexpr std::string_view traceLine = "GPRSInformation";
  static const PacketHandlers<GPRSInformation> handlers;

 private:
  void updatePacketControl(const Packet& packet);
  void updateOperatingMode(const Packet& packet);
  void updateCellOptions(const Packet& packet);
  void updateControlChannel(const Packet& packet);
  void updatePacketSystemInformation(const Packet& packet);
  void updateSystemInformation13(const Packet& packet);
  void updateReselection(const Packet& packet);
};

}  // namespace varnel
