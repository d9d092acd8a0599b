#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The state of the mobility management, in short.
class ProcessCO final : public SectionDecoder<ProcessCO> {
 public:
  static constexpr std::string_view sectionName = "Process CO";
  // Kept: the text of `ProcessCS`.
  static constexpr std::string_view traceLine = "ProcessCS";
  static const PacketHandlers<ProcessCO> handlers;

 private:
  void updateState(const Packet& packet);
  void updateRegistration(const Packet& packet);
};

}  // namespace varnel
