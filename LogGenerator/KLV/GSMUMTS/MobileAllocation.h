#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The channels that the GSM connection hops over.
class MobileAllocation final : public SectionDecoder<MobileAllocation> {
 public:
  static constexpr std::string_view sectionName = "Mobile Allocation";
  static constexpr std::string_view traceLine = "MobileAllocation";
  static const PacketHandlers<MobileAllocation> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel
