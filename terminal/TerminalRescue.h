#pragma once

#include <termios.h>

#include <string>

namespace varnel {

/// Gives the terminal back when the program is ended by a signal of its own, such as that of std::abort. The
/// program then ends by that signal as it would have without this.
///
/// There is one terminal, so all of this is about the whole process.
namespace TerminalRescue {

/// From now on, `leave` is written to standard output in that case, and the mode is set.
void arm(const termios& mode, const std::string& leave);
/// The terminal is as it was found.
void disarm();
/// Afterwards the contents of this file follow; -1 for none.
void setHeldFile(int descriptor);

}  // namespace TerminalRescue

}  // namespace varnel
