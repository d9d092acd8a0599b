#pragma once

#include "LogGenerator/Base.h"

namespace varnel {

/// The active packet-data contexts: the last array from the telephony server. Other payloads are ignored.
class PDPContextList final : public Base {
 public:
  std::string_view getSectionName() const override { return "PDP Context Info"; }
  std::vector<std::uint32_t> getLogCodeArray() const override;
  void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) override;
};

}  // namespace varnel
