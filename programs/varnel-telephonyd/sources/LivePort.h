#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <list>
#include <memory>
#include <optional>
#include <string>

#include "host/captures/CaptureRecord.h"
#include "platform/MainQueue.h"
#include "programs/varnel-telephonyd/MessageSource.h"
#include "programs/varnel-telephonyd/sources/DeviceReads.h"
#include "programs/varnel-telephonyd/sources/PortDevice.h"
#include "programs/varnel-telephonyd/sources/PortSession.h"

namespace varnel {

class PortSource;

/// A modem's diagnostic port, for all viewers together. Each viewer gets what the modem sends. The modem
/// sends the log codes that at least one viewer has asked for. When the device is unplugged, or answers no
/// more, it is opened again as soon as it can be.
class LivePort final {
 public:
  struct Setup {
    std::unique_ptr<PortDevice> device;
    MainQueue& queue;
    std::function<std::chrono::milliseconds()> uptime;
    std::string name;  ///< of the device, for users
    /// Tells the server's user one sentence.
    std::function<void(const std::string& sentence)> tell;
    /// Called once, when the modem is known to be one. Gets what the modem calls its build, or nothing.
    std::function<void(const std::string& build)> ready;
    /// Called at most once, and never after `ready`, when the port cannot be used. Gets one sentence that
    /// says why, and what to do.
    std::function<void(const std::string& sentence)> failed;
  };

  explicit LivePort(Setup setup);
  LivePort(const LivePort&) = delete;
  LivePort& operator=(const LivePort&) = delete;
  /// The sources must be gone.
  ~LivePort() = default;

  /// Opens the device and begins to talk. Throws std::runtime_error with one sentence when it cannot be
  /// opened.
  void open();
  /// The stream for one more viewer, which starts now.
  std::unique_ptr<MessageSource> makeSource();
  /// Makes the modem quiet, closes the device, and then calls the function. A modem that does not answer
  /// takes 4 s.
  void end(std::function<void()> ended);
  bool isEnding() const { return _isEnding; }

  /// What viewers are told while there are no messages; empty when all is well.
  const std::string& note() const { return _note; }
  const std::string& name() const { return _setup.name; }
  /// The records that the modem has sent.
  std::uint64_t records() const { return _records; }
  /// The frames that held no record.
  const LeftOut& leftOut() const { return _leftOut; }

 private:
  friend class PortSource;

  void enter(PortSource& source);
  void leave(PortSource& source);
  void updateCodes();
  void updateCodesLater();

  std::optional<std::string> connect();
  void disconnect();
  void finish();
  void reconnectLater();
  void reconnect();
  void becomeReady();
  void takeBytes(ByteView bytes);
  void takeRecord(const CaptureRecord& record);
  void beUnplugged();
  void beRefused(std::size_t equipment, const std::string& detail);
  void fail(const PortFailure& failure);
  void tellMissingCodes();
  void setNote(const std::string& note);
  void wakeSources();

  const Setup _setup;
  std::list<PortSource*> _sources;
  LeftOut _leftOut;
  std::uint64_t _records = 0;
  DeviceReads _reads{_leftOut};
  std::unique_ptr<PortSession> _session;  // null while the device is closed
  bool _hasBeenReady = false;
  bool _isEnding = false;
  std::function<void()> _ended;  // until it is called
  std::string _note;
  std::string _lastTrouble;  // of the last attempt to open the device again
  std::size_t _toldMissing = 0;
  std::shared_ptr<bool> _life = std::make_shared<bool>();  // for tasks that may run after this object
};

/// What became of the frames of a port, as part of a line, such as "port: 7 records; 3 frames left out (1
/// torn, 2 encrypted)".
std::string inWords(std::uint64_t records, const LeftOut& leftOut);

}  // namespace varnel
