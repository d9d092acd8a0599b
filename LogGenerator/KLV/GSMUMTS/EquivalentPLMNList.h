#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The networks that count as the registered one, a row each.
class EquivalentPLMNList final : public SectionDecoder<EquivalentPLMNList> {
 public:
  static constexpr std::string_view sectionName = "Equivalent PLMN List";
  static constexpr std::string_view traceLine = "Equivalent PLMN List";
  static const PacketHandlers<EquivalentPLMNList> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel
