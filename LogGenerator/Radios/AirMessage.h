#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/MessageFate.h"
#include "LogGenerator/Packet.h"
#include "base/Bytes.h"

namespace varnel {

/// One message of the air interface, with what the modem says about it: RRC and NAS messages of LTE and NR,
/// RRC messages of UMTS, RR messages of GSM, NAS messages of GSM and UMTS.
struct AirMessage {
  enum class Radio : std::uint8_t { LTE, NR, UMTS, GSM };
  enum class Protocol : std::uint8_t { RRC, NAS, RR };
  enum class Direction : std::uint8_t { Unknown, Downlink, Uplink };

  Radio radio{};
  Protocol protocol{};
  Direction direction = Direction::Unknown;
  /// The logical channel as the standard writes it, as "DL-DCCH"; empty for NAS messages and for a type that
  /// no channel carries by itself.
  std::string_view channel{};
  /// The message's name as the standard writes it, as "RRCConnectionRelease" or "Attach request". One that is
  /// ciphered is "Security Protected (ciphered)", one that is not known "Unknown", and a choice that the
  /// standard keeps free is "Spare" or "Extension". The text is a constant of the program, as that of the
  /// channel is.
  std::string_view name{};
  /// The cell: the number of its channel, and its physical identity or scrambling code. Absent when the modem
  /// does not tell.
  std::optional<std::uint32_t> channelNumber{};
  std::optional<std::uint16_t> physicalCell{};
  std::optional<std::uint16_t> frame{};
  std::optional<std::uint8_t> subframe{};
  /// The message itself, without the modem's header. The bytes are the packet's, or those that the reader
  /// joined: valid while the packet is, and until the reader reads again.
  ByteView bytes{};
  /// How many of these bytes come before layer 3: the pseudo length of messages on GSM's BCCH, CCCH and SACCH
  /// (TS 44.018 10.5.2.19). A packet analyzer takes the message without them.
  std::uint8_t layer2Octets = 0;
};

/// What a packet yields: a message, or why there is none. A packet whose version is not listed is of an
/// unknown version. One whose length does not agree with what it says is too short. A part of a longer
/// message yields none yet, but counts as decoded.
struct AirMessageReading {
  MessageFate fate;
  std::optional<AirMessage> message{};
  /// The version of the packet; absent for a packet without one.
  std::optional<PacketVersion> version{};
};

/// The log codes of the packets that carry such messages.
std::span<const std::uint32_t> airMessageLogCodes();

/// Reads messages from packets of these codes. Joins the parts of long messages, so one reader must get all
/// packets of one subscription, in their order. Keeps the parts of one message per log code, at most 64 KiB.
class AirMessageReader {
 public:
  static constexpr std::size_t longestJoined = 65536;

  /// Reads a packet with one of the codes. The NAS messages of GSM and UMTS share a log code: the reader
  /// takes one as of the radio, of these two, whose RRC or RR message it read last, and as of GSM before the
  /// first.
  AirMessageReading read(const Packet& packet, std::uint32_t logCode);
  /// What would become of the packet, without its message.
  static MessageFate fateOf(const Packet& packet, std::uint32_t logCode);

 private:
  // The parts so far of a message.
  struct Parts {
    std::uint32_t logCode;
    unsigned version, channel;  // the same in all parts
    unsigned lastSegment = 0;   // 0: none is waiting
    Bytes bytes{};
  };

  bool join(AirMessage& message, unsigned segment, const Parts& key);

  std::vector<Parts> _parts;
  Bytes _joined;  // the bytes of the message that was joined last
  AirMessage::Radio _circuitRadio = AirMessage::Radio::GSM;
};

/// "LTE", "RRC" and "Downlink", for displays. An unknown direction has an empty text.
std::string_view nameOf(AirMessage::Radio radio);
std::string_view nameOf(AirMessage::Protocol protocol);
std::string_view nameOf(AirMessage::Direction direction);
/// What the radio calls the numbers of its channels: "EARFCN".
std::string_view channelNumberName(AirMessage::Radio radio);

}  // namespace varnel
