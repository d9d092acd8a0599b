#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string_view>

#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/ServedChannel.h"

namespace varnel {

/// Makes log channels and serves them until their viewers go away. Every channel has a stream of its own.
class TelephonyServer {
 public:
  explicit TelephonyServer(ChannelHost host);
  TelephonyServer(const TelephonyServer&) = delete;
  TelephonyServer& operator=(const TelephonyServer&) = delete;

  /// Errors of a request for a log channel.
  static constexpr std::int64_t viewerPortMissing = 6;  ///< no port of that name answers
  static constexpr std::int64_t commandPortNotMade = 7;

  /// Makes a channel that delivers to the viewer's port of that name and takes commands on a new port.
  TelephonyConnection::LogChannel createLogChannel(std::string_view viewerPortName);

  std::size_t channels() const { return _channels.size(); }

 private:
  unsigned freeNumber() const;
  void close(unsigned number);
  void checkViewers();

  const ChannelHost _host;
  std::map<unsigned, std::shared_ptr<ServedChannel>> _channels;  // by the number in their port's name
  // A viewer may go away without a word while nothing is sent to it.
  std::unique_ptr<RepeatingTimer> _viewerCheck;
};

}  // namespace varnel
