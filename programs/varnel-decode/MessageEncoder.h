#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>

#include "LogGenerator/MessageFate.h"
#include "LogGenerator/Radios/AirMessage.h"
#include "host/captures/CaptureEncoder.h"
#include "host/captures/PcapngBlocks.h"
#include "programs/varnel-decode/MessagePackets.h"

namespace varnel {

/// pcapng of the RRC and NAS messages in a capture, each a packet with its time, direction, channel and cell.
/// Each subscription has an interface of its own.
class MessageEncoder final : public CaptureEncoder {
 public:
  explicit MessageEncoder(MessageForm form) : _form(form) {}
  ByteView beginning() override;
  /// Empty also for records that hold no such message, and for a part of a longer message.
  ByteView encode(const CaptureRecord& record) override;
  /// Why messages are not in the file, or that the capture has none.
  std::optional<std::string> remark(const std::string& captureName, const std::string& path) const override;

 private:
  struct Source {
    AirMessageReader reader{};
    std::optional<std::uint32_t> interface {};  // absent before its first packet
  };

  void append(const AirMessage& message, const CaptureRecord& record, Source& source);
  void count(MessageFate::Outcome outcome);

  const MessageForm _form;
  std::map<std::optional<std::uint8_t>, Source> _sources;  // by subscription
  std::uint32_t _interfaces = 0;
  std::uint64_t _written = 0;
  std::map<std::string, std::uint64_t> _withoutPacket;  // counts of messages by reason
  std::uint64_t _ofUnknownVersion = 0, _damaged = 0;
  Bytes _bytes;
};

}  // namespace varnel
