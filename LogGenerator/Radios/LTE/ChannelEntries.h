#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "LogGenerator/Radios/ChannelText.h"

namespace varnel::lte {

/// What the records of cells show of their channel. Remembers the last channel, since a packet lists the
/// cells of one.
class ChannelEntries {
 public:
  /// The channel of the cells that follow.
  void setChannel(std::uint32_t earfcn) {
    if (_earfcn == earfcn) return;
    _earfcn = earfcn;
    _number = std::to_string(earfcn);
    _band = channels::lteBand(earfcn);
    _frequency = channels::lteDownlinkFrequency(earfcn);
  }

  std::uint32_t earfcn() const { return _earfcn.value_or(0); }
  const std::string& number() const { return _number; }
  /// These are empty when no band has the channel.
  const std::string& band() const { return _band; }
  const std::string& frequency() const { return _frequency; }

 private:
  std::optional<std::uint32_t> _earfcn;
  std::string _number, _band, _frequency;
};

}  // namespace varnel::lte
