#pragma once

#include <array>
#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "base/Time.h"
#include "host/captures/StreamEncoders.h"
#include "platform/MainQueue.h"
#include "programs/varnel-telephonyd/simulation/SimulatedModem.h"
#include "programs/varnel-telephonyd/sources/FrameStream.h"
#include "programs/varnel-telephonyd/sources/PortCommands.h"

namespace varnel {

/// The diagnostic port of a simulated modem, from the modem's side. It answers requests, and sends those
/// records whose log codes are switched on, at the pace of a real modem. While no log code is on, the phone
/// of the modem stands still.
class SimulatedPort final {
 public:
  struct Setup {
    std::unique_ptr<SimulatedModem> modem;
    MainQueue& queue;
    std::function<std::chrono::milliseconds()> uptime;
    std::function<Time()> now;  ///< the modem's clock
    /// Sends a frame to whoever reads the port. False when it has no room, or when nobody reads.
    std::function<bool(ByteView frame)> send;
    std::string build;  ///< what the modem calls its build
  };

  explicit SimulatedPort(Setup setup);
  SimulatedPort(const SimulatedPort&) = delete;
  SimulatedPort& operator=(const SimulatedPort&) = delete;
  ~SimulatedPort() = default;

  /// Takes bytes that were written to the port.
  void take(ByteView bytes);

  /// The records that were sent.
  std::uint64_t sent() const { return _sent; }
  /// The records that were not taken.
  std::uint64_t dropped() const { return _dropped; }

 private:
  using Milliseconds = std::chrono::milliseconds;

  void answer(ByteView request);
  Bytes answerTo(ByteView request);
  Bytes configure(ByteView request);
  Bytes setCodes(ByteView request);
  bool isOn(std::uint32_t code) const;
  void switchPhone();
  void playLater();
  void play();
  void sendRecord(const SimulatedMessage& message);

  const Setup _setup;
  LeftOut _leftOut;  // requests that are not sound
  FrameStream _requests{_leftOut};
  std::array<Bytes, equipments> _masks;
  FramedWriter _writer;
  SimulatedMessage _next;

  bool _isWalking = false;     // the phone does not stand still
  Milliseconds _phoneTime{0};  // how long it has walked until it last stood still
  Milliseconds _walksSince{0};
  Time _walkedOffAt{};
  std::uint64_t _walks = 0;  // to tell tasks of the current walk from those of older ones

  std::uint64_t _sent = 0, _dropped = 0;
  std::shared_ptr<bool> _life = std::make_shared<bool>();  // for tasks that may run after this object
};

}  // namespace varnel
