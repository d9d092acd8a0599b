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

/// What the program is asked to do. One of `portPath`, `simulatedTechnology`, and `replayPath` is set.
struct Options {
  std::optional<std::string> portPath;  ///< automaticPort: the server looks for one
  bool inhibitsModemManager = false;

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

/// The status to end with when the command line leaves nothing to do: 0 after help, 2 after a mistake.
struct ExitStatus {
  int code;
};

/// Reads the command line. Help and version go to standard output; a mistake is one line on standard error.
std::variant<Options, ExitStatus> readOptions(int argumentCount, const char* const* arguments,
                                              const std::string& version);

}  // namespace varnel
