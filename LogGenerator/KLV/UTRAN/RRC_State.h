#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The state of the UTRAN radio resource control connection (3GPP TS 25.331).
class RRC_State final : public SectionDecoder<RRC_State> {
 public:
  static constexpr std::string_view sectionName = "RRC Info";
  static constexpr std::string_view traceLine = "RRC Info";
  static constexpr UnknownCodes unknownCodes = UnknownCodes::Ignored;
  static const PacketHandlers<RRC_State> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel
