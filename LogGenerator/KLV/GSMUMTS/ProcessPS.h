#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The packet-switched mobility management (GMM).
class ProcessPS final : public SectionDecoder<ProcessPS> {
 public:
  static constexpr std::string_view sectionName = "Process PS";
  static constexpr std::string_view traceLine = "ProcessPS";
  static const PacketHandlers<ProcessPS> handlers;

 private:
  void updateState(const Packet& packet);
  void updateRegistration(const Packet& packet);
};

}  // namespace varnel
