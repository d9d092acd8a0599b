#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "LogGenerator/Radios/MessageSection.h"

namespace varnel::lte {

/// The section "Connection": whether the phone has an RRC connection, and how many it has set up or resumed,
/// as its RRC messages tell. Goes on from the number that the section already holds.
class Connection final : public MessageSection {
 public:
  Connection() : MessageSection(sectionName) {}
  explicit Connection(MessageFeed& feed) : MessageSection(sectionName, feed) {}

  std::vector<std::uint32_t> getLogCodeArray() const override { return {0xB0C0}; }

 private:
  static constexpr std::string_view sectionName = "Connection";

  void take(const AirMessageReading& reading) override;
};

}  // namespace varnel::lte
