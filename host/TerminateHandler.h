#pragma once

#include <string>

namespace varnel {

/// Sets the terminate handler. When an exception ends the program, the handler says so on standard error in
/// one line, waits a moment for pending log lines, and aborts.
void installTerminateHandler(std::string programName);

}  // namespace varnel
