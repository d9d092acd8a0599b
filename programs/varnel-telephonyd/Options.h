#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <variant>

#include "base/Log.h"
#include "host/RecordingFile.h"
#include "programs/varnel-telephonyd/Fault.h"

namespace varnel {

/// In place of a device's path.
inline constexpr const char* automaticPort = "auto";

/// What the program is asked to do. At most one of `portPath`, `isLive`, `simulatedTechnology`, and
/// `replayPath` is set. Without any of them the server takes what is there.
struct Options {
  std::optional<std::string> portPath;  ///< automaticPort: the server looks for one
  bool inhibitsModemManager = false;

  bool isLive = false;           ///< shows what ModemManager tells
  std::string modem{};           ///< ModemManager's index or path; empty: any
  unsigned poll_s = 5;           ///< how often ModemManager is asked what it does not signal
  bool recordsPosition = false;  ///< whether packets, and so recordings, have positions

  std::optional<std::string> simulatedTechnology;
  std::uint64_t seed = 1;
  bool playsPort = false;  ///< on a pseudo-terminal, instead of serving the log channel

  std::optional<std::string> replayPath;
  /// The technology that viewers are told; absent: the one that the capture names, else all radios.
  std::optional<std::string> replayTechnology;
  double speed = 1;
  bool loops = false;
  std::optional<unsigned> subscription;  ///< 1 to 255; absent: the first one in the capture, or all

  std::optional<std::string> recordPath;  ///< absent: nothing is recorded
  bool recordPathIsOfNow = false;         ///< whether the user has named it by fields of the time
  ExistingRecording existingRecording = ExistingRecording::Refused;
  std::optional<std::string> runtimeFolder;
  Fault fault{};
  std::optional<std::string> allowedGroup;  ///< whose members may connect too; absent: only this user may
  int logLevel = logErrorPriority;          ///< the highest priority number that goes to standard error
};

/// Whether no option says where messages come from.
inline bool namesNoSource(const Options& options) {
  return !options.portPath && !options.isLive && !options.simulatedTechnology && !options.replayPath;
}

/// The status to end with when the command line leaves nothing to do: 0 after help, 2 after a mistake.
struct ExitStatus {
  int code;
};

/// Reads the command line. Help and version go to standard output; a mistake is one line on standard error.
std::variant<Options, ExitStatus> readOptions(int argumentCount, const char* const* arguments,
                                              const std::string& version);

}  // namespace varnel
