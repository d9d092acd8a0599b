#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The circuit-switched mobility management (MM).
class ProcessCS final : public SectionDecoder<ProcessCS> {
 public:
  static constexpr std::string_view sectionName = "Process CS";
  static constexpr std::string_view traceLine = "ProcessCS";
  static const PacketHandlers<ProcessCS> handlers;

 private:
  void updateState(const Packet& packet);
  void updateRegistration(const Packet& packet);
};

}  // namespace varnel
