#pragma once

#include "LogGenerator/Base.h"

namespace varnel {

/// Names for the log code of the telephony server's SIM files.
namespace LogCode_0xFF0000 {

/// Raised for a SIM payload that cannot be read. No code catches it, so the program ends.
class UnknownDataException : public std::exception {
 public:
  const char* what() const noexcept override { return "LogCode_0xFF0000::UnknownDataException"; }
};

}  // namespace LogCode_0xFF0000

/// The SIM card's elementary files (3GPP TS 31.102), as the telephony server formats them. Entries
/// accumulate: a message replaces the entries that it has, and leaves the others.
class SimInfo final : public Base {
 public:
  std::string_view getSectionName() const override { return "SIM Info"; }
  std::vector<std::uint32_t> getLogCodeArray() const override;
  void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) override;
};

}  // namespace varnel
