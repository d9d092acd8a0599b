#include "programs/varnel-decode/MessageEncoder.h"

#include <algorithm>

#include "LogGenerator/LogMessage.h"
#include "host/Subscription.h"
#include "programs/varnel-decode/MessageDissectors.h"

namespace varnel {

namespace {

using Outcome = MessageFate::Outcome;

pcapng::Direction directionOf(const AirMessage& message) {
  switch (message.direction) {
    case AirMessage::Direction::Downlink:
      return pcapng::Direction::Inbound;
    case AirMessage::Direction::Uplink:
      return pcapng::Direction::Outbound;
    case AirMessage::Direction::Unknown:
      break;
  }
  return pcapng::Direction::Unknown;
}

// Why there is no packet for the message, behind the number of such messages.
std::string reasonFor(const AirMessage& message) {
  std::string reason = " of ";
  reason.append(nameOf(message.radio)).append(" ").append(nameOf(message.protocol));
  if (message.bytes.size() <= message.layer2Octets) return reason + " without contents";
  if (dissectorOf(message)) return reason + ", which GSMTAP cannot hold";
  if (!message.channel.empty()) reason.append(" ").append(message.channel);
  return reason + ", which no dissector reads";
}

bool carriesMessage(const LogMessage& message) {
  const auto codes = airMessageLogCodes();
  return message.logType() == LogMessage::modemLogType &&
         std::ranges::find(codes, message.logCode()) != codes.end();
}

}  // namespace

ByteView MessageEncoder::beginning() {
  _bytes.clear();
  pcapng::appendSection(_bytes);
  return _bytes;
}

ByteView MessageEncoder::encode(const CaptureRecord& record) {
  _bytes.clear();
  const auto message = LogMessage::framed(record.message);
  if (!message || !carriesMessage(*message)) return {};
  Source& source = _sources[record.subscription];
  const AirMessageReading reading = source.reader.read(message->packet(), message->logCode());
  if (reading.message)
    append(*reading.message, record, source);
  else
    count(reading.fate.outcome);
  return _bytes;
}

void MessageEncoder::append(const AirMessage& message, const CaptureRecord& record, Source& source) {
  const auto packet = messagePacket(message, _form);
  if (!packet) {
    ++_withoutPacket[reasonFor(message)];
    leaveOut();
    return;
  }
  if (!source.interface) {
    source.interface = _interfaces++;
    const std::string name = subscriptionName(record.subscription);
    pcapng::appendInterface(_bytes, {.linkType = linkTypeOf(_form), .name = name});
  }
  ++_written;
  const std::string comment = messageComment(message);
  pcapng::appendPacket(_bytes, {.interface = *source.interface,
                                .time = record.time,
                                .bytes = *packet,
                                .comment = comment,
                                .direction = directionOf(message)});
}

void MessageEncoder::count(Outcome outcome) {
  if (outcome == Outcome::Decoded) return;  // a part of a longer message
  ++(outcome == Outcome::UnknownVersion ? _ofUnknownVersion : _damaged);
  leaveOut();
}

std::optional<std::string> MessageEncoder::remark(const std::string& captureName,
                                                  const std::string& path) const {
  if (_written == 0 && leftOut() == 0)
    return captureName + " has no RRC or NAS messages, so " + path + " is empty";
  if (leftOut() == 0) return std::nullopt;
  std::string reasons;
  const auto add = [&](std::uint64_t count, std::string_view reason) {
    if (count == 0) return;
    reasons.append(reasons.empty() ? "" : ", ").append(std::to_string(count)).append(reason);
  };
  for (const auto& [reason, count] : _withoutPacket) add(count, reason);
  add(_ofUnknownVersion, " of versions that are not known");
  add(_damaged, " whose lengths are wrong");
  return std::to_string(leftOut()) + (leftOut() == 1 ? " message of " : " messages of ") + captureName +
         (leftOut() == 1 ? " is" : " are") + " not in " + path + ": " + reasons;
}

}  // namespace varnel
