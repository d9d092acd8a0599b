#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <variant>

#include "base/Bytes.h"
#include "base/Time.h"

namespace varnel {

/// The slowest and the fastest speed of a replay.
inline constexpr double slowestSpeed = 0.001, fastestSpeed = 1'000'000;

/// Whether a replay can have this speed; false for what is no number.
constexpr bool isPlayable(double speed) { return speed >= slowestSpeed && speed <= fastestSpeed; }

/// A place in a stream, by how long playing takes until there at speed 1, or by the capture's clock.
using StreamPlace = std::variant<std::chrono::milliseconds, Time>;

/// What somebody asks of a running telephony server.
struct ControlRequest {
  enum class Command { Status, Pause, Continue, SetSpeed, Seek, SetTechnology, Stop };

  Command command = Command::Status;
  double speed = 1;          ///< of `SetSpeed`
  StreamPlace place{};       ///< of `Seek`
  std::string technology{};  ///< of `SetTechnology`

  bool operator==(const ControlRequest&) const = default;
};

/// What a running telephony server does.
struct ServerStatus {
  /// What is served: "port", "ModemManager", "simulation", "capture", or "standard input".
  std::string source{};
  std::string name{};         ///< of the device or the capture; empty for a simulation and ModemManager
  std::string modem{};        ///< one sentence about ModemManager's modem; empty for other sources
  std::string technology{};   ///< as viewers are told
  std::string recording{};    ///< the file of the recording; empty when there is none
  std::uint64_t clients = 0;  ///< viewers that have a channel or are connected to the telephony service
  std::uint64_t channels = 0;

  /// What became of the messages. `received` is the sum of the others.
  std::uint64_t received = 0, delivered = 0, waiting = 0, dropped = 0, tooLong = 0, notAskedFor = 0;
  /// Frames that are torn, broken, too long, or have a wrong checksum. Absent where there are no frames, and
  /// for a capture while it is not known yet.
  std::optional<std::uint64_t> badFrames{};

  bool isPlayable = false;  ///< whether the stream can be paused and played at other speeds, and has places
  bool isPaused = false;
  bool isSeeking = false;  ///< whether everything before the place of a seek is being sent
  double speed = 1;
  /// How long playing takes at speed 1, until the last message and until the end. Absent when not known.
  std::optional<std::chrono::milliseconds> position{}, length{};
  /// By the capture's clock: the time of the last message, and of the first and the last one of the capture.
  /// Absent when not known.
  std::optional<Time> time{}, firstTime{}, lastTime{};

  std::uint64_t refused() const { return tooLong + notAskedFor; }
  bool operator==(const ServerStatus&) const = default;
};

/// The sentence that says why a request is refused.
struct ControlRefusal {
  std::string sentence;

  bool operator==(const ControlRefusal&) const = default;
};
using ControlReply = std::variant<ServerStatus, ControlRefusal>;

/// The messages between a telephony server and those who control it, over a local socket of the runtime
/// folder. A request and its reply are dictionaries, written as property lists, one per frame.
/// docs/formats.md has their keys.
namespace controlProtocol {

inline constexpr std::string_view socketName = "com.orvane.TelephonyServer.Control";
/// No request is longer, in bytes.
inline constexpr std::size_t longestRequest = 4096;

Bytes writeRequest(const ControlRequest& request);
/// Nothing for bytes that are no request.
std::optional<ControlRequest> readRequest(ByteView bytes);

Bytes writeReply(const ControlReply& reply);
/// Nothing for bytes that are no reply.
std::optional<ControlReply> readReply(ByteView bytes);

}  // namespace controlProtocol

}  // namespace varnel
