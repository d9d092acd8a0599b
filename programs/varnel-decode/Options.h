#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "platform/Log.h"
#include "programs/varnel-decode/TreeWriters.h"

namespace varnel {

/// What the program is asked to do.
struct Options {
  std::string technology;
  DisplayWriter writeDisplay = displayAsText;
  int logLevel = logErrorPriority;  ///< the highest priority number that goes to standard error; -1 for none
  std::optional<std::string> snapshotPath;  ///< where to write a snapshot file
  std::string capturePath;                  ///< "-" is standard input
};

/// The status to end with when the command line leaves nothing to do: 0 after help, 2 after a mistake.
struct ExitStatus {
  int code;
};

/// Reads the command line, which may name one of those technologies. Help goes to standard output, a mistake
/// is one line on standard error.
std::variant<Options, ExitStatus> readOptions(int argumentCount, const char* const* arguments,
                                              const std::vector<std::string>& technologies);

}  // namespace varnel
