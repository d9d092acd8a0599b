#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "LogGenerator/Base.h"
#include "LogGenerator/Radios/MessageFeed.h"

namespace varnel {

/// The base of decoders that show messages of the air interface. Those of one index share a feed; one that
/// gets none has a feed of its own.
class MessageSection : public Base {
 public:
  std::string_view getSectionName() const final { return _sectionName; }
  void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) final;
  MessageFate fateOf(const Packet& packet, std::uint32_t logCode) const final;
  /// Whether the last packet that the section got was decoded. It saves asking `fateOf`, which reads the
  /// packet again.
  bool hasDecodedLast() const { return _hasDecodedLast; }
  /// All codes of such messages.
  std::vector<std::uint32_t> getLogCodeArray() const override;

 protected:
  explicit MessageSection(std::string_view sectionName);
  MessageSection(std::string_view sectionName, MessageFeed& feed);

  /// A packet that was decoded, or whose version is not known.
  virtual void take(const AirMessageReading& reading) = 0;

 private:
  const std::string_view _sectionName;
  std::optional<MessageFeed> _ownFeed;
  MessageFeed& _feed;
  const MessageFeed::Taker _taker;
  bool _hasDecodedLast = false;
};

}  // namespace varnel
