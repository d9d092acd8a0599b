#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace varnel {

/// What the server does wrong because a test wants it to.
struct Fault {
  enum class Kind {
    None,
    DropChannel,        ///< each channel ends after this many messages
    Crash,              ///< the program aborts when this many messages were sent
    Garbage,            ///< each channel sends random bytes as a message after this many messages
    Silent,             ///< requests for the technology get no reply
    LateReply,          ///< they get it after two seconds, in which nothing else happens
    BadReply,           ///< they get a reply that is no property list
    EmptyReply,         ///< they get one without a technology
    UnknownTechnology,  ///< they get a technology that no viewer knows
    DropAfterReply,     ///< they get their reply, and the channel ends
    RefuseChannel,      ///< requests for a channel are refused
    NoPort,             ///< their reply names no port
    WrongPort,          ///< their reply names a port that is not there
  };

  Kind kind = Kind::None;
  std::uint64_t messages = 0;  ///< after how many messages the fault is made, where that has a meaning

  bool is(Kind other) const { return kind == other; }
  /// Whether the fault is of this kind and is made once this many messages were sent.
  bool isDue(Kind other, std::uint64_t sent) const { return kind == other && sent == messages; }
  bool operator==(const Fault&) const = default;
};

/// Reads a fault such as "silent" or "crash@100"; nothing for anything else.
std::optional<Fault> readFault(std::string_view text);
/// All faults as a user types them, such as "drop-channel@N, crash@N".
std::string namesOfFaults();

}  // namespace varnel
