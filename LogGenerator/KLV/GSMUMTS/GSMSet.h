#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The ranked GSM cells, a row each.
class GSMSet final : public SectionDecoder<GSMSet> {
 public:
  static constexpr std::string_view sectionName = "GSM Set";
  static constexpr std::string_view traceLine = "GSMSet";
  static const PacketHandlers<GSMSet> handlers;

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel
