#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The block errors of the UMTS transport channels.
class BLER final : public SectionDecoder<BLER> {
 public:
  static constexpr std::string_view sectionName = "BLER";
  static constexpr std::string_view traceLine = "BLER";
  static const PacketHandlers<BLER> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel
