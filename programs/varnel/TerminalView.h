#pragma once

#include "programs/varnel/Options.h"

namespace varnel {

/// Shows the display on the whole screen of the terminal until the user leaves it or the program is asked to
/// end. Returns the exit status. Throws std::runtime_error when there is no terminal that can be used.
int viewInTerminal(int& argumentCount, char** arguments, const Options& options,
                   const ApplicationInfo& application);

}  // namespace varnel
