#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

#include "LogGenerator/Radios/AirMessage.h"
#include "base/Bytes.h"

namespace varnel {

inline constexpr std::string_view spareMessage = "Spare";
inline constexpr std::string_view extensionMessage = "Extension";
inline constexpr std::string_view unknownMessage = "Unknown";
inline constexpr std::string_view cipheredMessage = "Security Protected (ciphered)";

/// A CHOICE of messages without an extension mark, in the unaligned packed encoding (ITU-T X.691): a number
/// that selects one of the alternatives, in as many bits as the greatest one needs.
struct MessageChoice {
  struct Alternative {
    // Not explicit: tables list alternatives by their names.
    constexpr Alternative(const char* itsName) : name(itsName) {}
    constexpr Alternative(std::string_view itsName) : name(itsName) {}
    constexpr Alternative(const MessageChoice& itsChoice) : choice(&itsChoice) {}

    std::string_view name{};
    const MessageChoice* choice = nullptr;  ///< another choice follows
  };

  template <std::size_t size>
  constexpr MessageChoice(const Alternative (&itsAlternatives)[size]) : alternatives(itsAlternatives) {}

  std::span<const Alternative> alternatives;
};

/// A logical channel of RRC messages, or a type of message that no channel carries by itself.
struct MessageChannel {
  /// Whether an information for the integrity check may come first (TS 25.331 10.3.3.16).
  enum class IntegrityCheck : std::uint8_t { None, Optional };

  std::string_view name;  ///< empty for a type of message
  /// What a message on the channel begins with: a choice, or else always this message.
  const MessageChoice* choice;
  std::string_view message;
  AirMessage::Direction direction;
  IntegrityCheck integrityCheck = IntegrityCheck::None;
};

/// The name of the message that these bytes are on the channel. A message that ends within its choice is
/// "Unknown".
std::string_view messageName(const MessageChannel& channel, ByteView bytes);

}  // namespace varnel
