#pragma once

#include <array>
#include <cstddef>
#include <optional>
#include <string_view>
#include <utility>

#include "LogGenerator/Radios/MessageSection.h"

namespace varnel {

/// The section "Last Messages": the last 50 messages of all radios, the newest first, and the version of the
/// last packet that has one. A modem may send thousands of messages per second, so `prepareDisplay` writes
/// both. A list that the section already holds goes on.
class LastMessages final : public MessageSection {
 public:
  static constexpr std::size_t greatestCount = 50;

  LastMessages() : MessageSection(sectionName) {}
  explicit LastMessages(MessageFeed& feed) : MessageSection(sectionName, feed) {}

  void prepareDisplay(const Time& now) override;

 private:
  static constexpr std::string_view sectionName = "Last Messages";

  // A message without its bytes.
  struct Received {
    Time time{};
    AirMessage message{};
    std::size_t length = 0;
  };
  // The version of a packet, and whether it is known.
  using Version = std::pair<PacketVersion, bool>;

  void take(const AirMessageReading& reading) override;
  static Value recordOf(const Received& received, std::string_view time);

  // A ring of the messages since the last display.
  std::array<Received, greatestCount> _received;
  std::size_t _next = 0, _count = 0;
  std::optional<Version> _version;  // of the last packet since then
};

}  // namespace varnel
