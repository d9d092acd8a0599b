#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "LogGenerator/Radios/AirMessage.h"
#include "base/Bytes.h"

namespace varnel {

/// How a packet analyzer gets messages.
enum class MessageForm : std::uint8_t {
  UpperPdu,  ///< each begins with the name of its dissector
  Gsmtap,    ///< GSMTAP version 2 in UDP and IPv4; without messages of NR
};

/// The link type of a capture of that form.
std::uint16_t linkTypeOf(MessageForm form);

/// The packet that holds the message. Nothing when the form cannot hold it, and for a message that no
/// dissector reads.
std::optional<Bytes> messagePacket(const AirMessage& message, MessageForm form);

/// What the packet itself cannot say, as "LTE RRC DL-DCCH, EARFCN 5230, cell 289, SFN 392.4". What is not
/// known is left out.
std::string messageComment(const AirMessage& message);

}  // namespace varnel
