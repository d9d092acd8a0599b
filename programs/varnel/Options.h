#pragma once

#include <CLI/CLI.hpp>
#include <optional>
#include <string>

#include "platform/ApplicationInfo.h"

namespace varnel {

inline constexpr const char* programName = "varnel";

/// What the command line asks for.
struct Options {
  std::optional<std::string> file;        ///< a capture or a snapshot to show; absent: a server is shown
  std::optional<std::string> technology;  ///< of the capture; absent: what the capture names, else all radios
  std::string userInterface = "auto";
  std::optional<std::string> deviceRoot;  ///< absent: / if that is a device, else the program's state folder
  std::optional<std::string> runtimeFolder;
  int logLevel = -1;  ///< the highest priority number that goes to standard error; -1 for none
  std::optional<unsigned> updates;
  std::optional<unsigned> subscription;  ///< 1 to 255; absent: all
  bool showsIdentities = false;
};

/// Declares the options to the parser of the command line, which fills them. They must outlive the parser.
void declare(CLI::App& parser, Options& options, const ApplicationInfo& application);

}  // namespace varnel
