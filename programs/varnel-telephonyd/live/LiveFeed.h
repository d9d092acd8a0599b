#pragma once

#include <array>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <list>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "base/Bytes.h"
#include "base/Value.h"
#include "programs/varnel-telephonyd/MessageSource.h"

namespace varnel {

/// The server's own packets for all viewers together. A viewer that comes gets the last packet of each kind
/// at once, so that it sees what has not changed since.
class LiveFeed final {
 public:
  struct Setup {
    std::function<std::chrono::milliseconds()> uptime;
    std::string name;  ///< for log lines
    /// Called when the first viewer comes, and when the last one has gone. May be empty.
    std::function<void()> viewersChanged{};
  };
  /// Whether a packet goes out that is the same as the last one of its kind.
  enum class Repetition : std::uint8_t { IsLeftOut, IsSent };

  explicit LiveFeed(Setup setup) : _setup(std::move(setup)) {}
  LiveFeed(const LiveFeed&) = delete;
  LiveFeed& operator=(const LiveFeed&) = delete;
  /// The sources must be gone.
  ~LiveFeed() = default;

  /// The stream for one more viewer, which starts now.
  std::unique_ptr<MessageSource> makeSource();
  bool hasViewers() const { return !_sources.empty(); }

  /// Sends a packet of this log code, 0xFF0000 to 0xFF0003.
  void send(std::uint32_t logCode, const Value& payload, Repetition repetition = Repetition::IsLeftOut);
  /// What viewers are told while they wait; empty when all is well.
  void setNote(const std::string& note);
  const std::string& note() const { return _note; }
  /// The packets that were made.
  std::uint64_t sent() const { return _sent; }

 private:
  class Source;

  struct Packet {
    Bytes payload, message;  // empty before the first one
  };

  const Setup _setup;
  std::list<Source*> _sources;
  std::array<Packet, 4> _last;  // by log code
  std::string _note;
  std::uint64_t _sent = 0;
};

}  // namespace varnel
