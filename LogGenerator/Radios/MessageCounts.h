#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "LogGenerator/Radios/MessageSection.h"

namespace varnel {

/// The section "Counts": how many messages of each name there were. An entry is a radio, a protocol and a
/// name. Counts that the section already holds go on. It has at most 200 such entries; messages of further
/// names count as "Other". The entries are written when a display is prepared.
class MessageCounts final : public MessageSection {
 public:
  static constexpr std::size_t greatestCount = 200;

  MessageCounts() : MessageSection(sectionName) {}
  explicit MessageCounts(MessageFeed& feed) : MessageSection(sectionName, feed) {}

  void prepareDisplay(const Time& now) override;

 private:
  static constexpr std::string_view sectionName = "Counts";

  // Names are constants of the program, so their addresses tell them apart.
  struct Kind {
    AirMessage::Radio radio;
    AirMessage::Protocol protocol;
    const char* name;

    bool operator==(const Kind&) const = default;
  };
  struct Hash {
    std::size_t operator()(const Kind& kind) const {
      const auto radioAndProtocol =
          static_cast<std::size_t>(kind.radio) * 4 + static_cast<std::size_t>(kind.protocol);
      return std::hash<const char*>()(kind.name) * 31 + radioAndProtocol;
    }
  };
  struct Count {
    std::string entry;
    std::uint64_t number = 0;  // since the last display
  };

  void take(const AirMessageReading& reading) override;
  void add(const Count& count, const Dictionary& entries);

  std::vector<Count> _counts;  // in the order in which their names first came
  std::unordered_map<Kind, std::size_t, Hash> _positions;
};

}  // namespace varnel
