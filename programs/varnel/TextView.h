#pragma once

#include "programs/varnel/Options.h"

namespace varnel {

/// Shows the display as text on standard output until the program is asked to end. Returns the exit status.
int viewAsText(int& argumentCount, char** arguments, const Options& options,
               const ApplicationInfo& application);

}  // namespace varnel
