#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// High-speed downlink packet access: what each HARQ process received.
class HSDPAInformation final : public SectionDecoder<HSDPAInformation> {
 public:
  static constexpr std::string_view sectionName = "HSDPA Info";
  static constexpr std::string_view traceLine = "HSDPA Info";
  static constexpr UnknownCodes unknownCodes = UnknownCodes::Ignored;
  static const PacketHandlers<HSDPAInformation> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel
