#pragma once

#include <span>

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The ranked GSM cells, a row each.
class GSMSet final : public SectionDecoder<GSMSet> {
 public:
  static constexpr std::string_view sectionName = "GSM Set";
  static constexpr std::string_view traceLine = "GSMSet";
  static std::span<const PacketHandler<GSMSet>> handlers();

 private:
  void update(const Packet& packet);
};

}  // namespace varnel
