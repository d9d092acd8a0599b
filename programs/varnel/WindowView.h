#pragma once

#include "programs/varnel/Options.h"

namespace varnel {

/// Shows the display in a window until the user closes it or the program is asked to end. Returns the exit
/// status. Throws std::runtime_error when there is no display.
int viewInWindow(int& argumentCount, char** arguments, const Options& options,
                 const ApplicationInfo& application);

}  // namespace varnel
