#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UMTS cells of the active set, a row each.
class ActiveSet final : public SectionDecoder<ActiveSet> {
 public:
  static constexpr std::string_view sectionName = "Active Set";
  static constexpr std::string_view traceLine = "ActiveSet";
  static const PacketHandlers<ActiveSet> handlers;

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel
