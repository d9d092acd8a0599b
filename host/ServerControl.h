#pragma once

#include <chrono>
#include <filesystem>

#include "host/ControlProtocol.h"
#include "host/RuntimeFolder.h"

namespace varnel {

/// Controls a running telephony server. Every operation connects to the server, waits for its reply, and
/// returns what the server does then. They throw std::runtime_error, one sentence that says what to do, when
/// no server is there, when it does not answer in time, or when it refuses. While an operation waits, nothing
/// else happens in its thread.
class ServerControl final {
 public:
  /// `runtimeFolder` is that of the server.
  explicit ServerControl(RuntimeFolder runtimeFolder,
                         std::chrono::milliseconds replyTimeout = std::chrono::seconds(2))
      : _folder(std::move(runtimeFolder)), _replyTimeout(replyTimeout) {}

  ServerStatus status() const { return ask({}); }
  /// Stops the streams where they are.
  ServerStatus pause() const { return ask({.command = ControlRequest::Command::Pause}); }
  /// Ends a pause.
  ServerStatus goOn() const { return ask({.command = ControlRequest::Command::Continue}); }
  /// Plays this many times as fast as the capture was made.
  ServerStatus setSpeed(double speed) const {
    return ask({.command = ControlRequest::Command::SetSpeed, .speed = speed});
  }
  /// Sends everything before this place at once; from the start again if it was passed. Viewers that are
  /// connected go on from there.
  ServerStatus seek(const StreamPlace& place) const {
    return ask({.command = ControlRequest::Command::Seek, .place = place});
  }
  /// Viewers lose their connection for a moment, and come back with this technology.
  ServerStatus setTechnology(const std::string& technology) const {
    return ask({.command = ControlRequest::Command::SetTechnology, .technology = technology});
  }
  /// Ends the server.
  ServerStatus stop() const { return ask({.command = ControlRequest::Command::Stop}); }

  ServerStatus ask(const ControlRequest& request) const;

  /// Whether a server is in the folder, also one that this user may not control.
  bool isThere() const;

 private:
  const RuntimeFolder _folder;
  const std::chrono::milliseconds _replyTimeout;
};

/// The folder of the server that a user means who names none: `own`, or the system's folder if it is shared
/// and only there a server is. Throws std::runtime_error when the path is too long for a socket.
RuntimeFolder nearestControl(RuntimeFolder own, const std::filesystem::path& system);

}  // namespace varnel
