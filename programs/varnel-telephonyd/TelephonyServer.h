#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>

#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/MessageCounts.h"
#include "programs/varnel-telephonyd/ServedChannel.h"

namespace varnel {

/// Makes log channels and serves them until their viewers go away. Every channel has its own stream.
class TelephonyServer {
 public:
  explicit TelephonyServer(ChannelHost host);
  TelephonyServer(const TelephonyServer&) = delete;
  TelephonyServer& operator=(const TelephonyServer&) = delete;

  /// Makes a channel that delivers to the viewer's port with this name, and takes commands on a new port.
  /// There are at most 16 channels. Refuses the names of the telephony service's own ports.
  TelephonyConnection::LogChannel createLogChannel(std::string_view viewerPortName);

  /// Sends this sentence to every viewer, also to those that come later.
  void note(const std::string& sentence);
  /// Ends every channel.
  void end();

  /// Stops all streams where they are; those that begin later wait at their start.
  void pause();
  void goOn();
  bool isPaused() const { return _isPaused; }
  /// Plays all streams this many times as fast as at speed 1, also those that begin later.
  void setSpeed(double speed);
  /// Moves all streams to this place. Those that begin later begin at their start.
  void seek(const StreamPlace& place);
  /// Tells viewers another technology, and ends every channel, so that the viewers come back and ask for the
  /// technology.
  void changeTechnology(const std::string& technology);
  const std::string& technology() const { return _host.technology; }
  /// Where the stream of the oldest channel is; absent without one.
  std::optional<StreamPosition> position() const;
  /// Whether a stream is being moved to the place of a seek.
  bool isSeeking() const;

  std::size_t channels() const { return _channels.size(); }
  /// The names of the viewers' ports that have channels.
  std::set<std::string, std::less<>> viewerPorts() const;
  /// The sums over all channels, including those that have ended.
  MessageCounts counts() const;

 private:
  unsigned freeNumber() const;
  void close(unsigned number);
  void countSent(ByteView message);
  void checkViewers();
  void tellLosses();

  ChannelHost _host;
  const std::function<void(ByteView message)> _messageSent;      // of the host that was given
  std::uint64_t _sent = 0;                                       // messages over all channels
  std::map<unsigned, std::shared_ptr<ServedChannel>> _channels;  // by the number in the name of their port
  MessageCounts _endedCounts;                                    // of channels that have ended
  bool _isPaused = false;
  std::optional<double> _speed;  // absent until one was set
  std::string _note;
  std::uint64_t _toldLosses = 0;
  std::chrono::milliseconds _lossesToldAt{0};
  // A viewer can go away silently while nothing is sent to it.
  std::unique_ptr<RepeatingTimer> _viewerCheck;
};

}  // namespace varnel
