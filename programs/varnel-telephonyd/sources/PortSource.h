#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <optional>
#include <string>
#include <utility>

#include "programs/varnel-telephonyd/CodeFilter.h"
#include "programs/varnel-telephonyd/MessageSource.h"
#include "programs/varnel-telephonyd/sources/LivePort.h"

namespace varnel {

/// The messages of a live port for one viewer, in the order in which the modem sends them. Those that the
/// viewer has not taken yet wait here: 16 MiB at most, with 64 bytes for each message beside its own. Newer
/// ones are lost.
class PortSource final : public MessageSource {
 public:
  static constexpr std::size_t mostWaiting = 16 << 20;
  static constexpr std::size_t costOfMessage = 64;

  /// The port must outlive the source.
  explicit PortSource(LivePort& port) : _port(port), _startedAt(port._setup.uptime()) { _port.enter(*this); }
  PortSource(const PortSource&) = delete;
  PortSource& operator=(const PortSource&) = delete;
  ~PortSource() override { _port.leave(*this); }

  void setFilter(const CodeFilter& filter) override {
    _filter = filter;
    _port.updateCodes();
  }
  std::optional<StreamMessage> next() override;
  bool isWaiting() const override { return true; }
  void setNewsHandler(std::function<void()> handler) override { _handler = std::move(handler); }
  std::string waitNote() const override { return _port.note(); }
  std::string nameOfLast() const override { return "A record of " + _port.name(); }
  Lateness lateness() const override { return Lateness::IsDropped; }
  std::uint64_t takeLost() override { return std::exchange(_lost, 0); }
  std::size_t waiting() const override { return _messages.size(); }

  /// What the viewer has asked for; absent until it has.
  const std::optional<CodeFilter>& filter() const { return _filter; }
  /// Takes a message of the modem.
  void push(std::chrono::milliseconds uptime, ByteView message);
  /// Tells the viewer's channel that there may be something new.
  void callHandler() const {
    if (_handler) _handler();
  }

 private:
  LivePort& _port;
  const std::chrono::milliseconds _startedAt;
  std::optional<CodeFilter> _filter;
  std::deque<StreamMessage> _messages;
  std::size_t _size = 0;  // of the messages, with their cost
  std::uint64_t _lost = 0;
  std::function<void()> _handler;
};

}  // namespace varnel
