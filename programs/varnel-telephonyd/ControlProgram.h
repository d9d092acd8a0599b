#pragma once

#include <string>

namespace varnel {

/// Whether the command line is one for a running server: its first argument is "ctl".
bool isControlCommand(int argumentCount, const char* const* arguments);

/// Sends a running server what the command line says, and returns the exit status. The status of the server
/// goes to standard output; an error is one line on standard error.
int runControlCommand(int argumentCount, char** arguments, const std::string& version);

}  // namespace varnel
