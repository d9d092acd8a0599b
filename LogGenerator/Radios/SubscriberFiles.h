#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "LogGenerator/Base.h"
#include "LogGenerator/Identities.h"

namespace varnel {

/// The SIM card's elementary files, as the telephony server formats them. Entries accumulate: a message
/// replaces the entries that it has, and leaves the others. While identities are hidden, a file that names a
/// person is only said to be present. Other payloads than a dictionary are dropped with a log line.
class SubscriberFiles final : public Base {
 public:
  explicit SubscriberFiles(Identities identities = Identities::Hidden) : _identities(identities) {}

  std::string_view getSectionName() const override { return "SIM Info"; }
  std::vector<std::uint32_t> getLogCodeArray() const override;
  void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) override;

 private:
  const Identities _identities;
};

}  // namespace varnel
