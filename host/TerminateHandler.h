#pragma once

#include <string>

namespace varnel {

/// From now on a program that ends by an exception says so on standard error, in one line, gives pending log
/// lines a moment to get out, and aborts.
void installTerminateHandler(std::string programName);

}  // namespace varnel
