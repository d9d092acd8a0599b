#pragma once

#include <string>

namespace varnel {

/// What is known of the terminal that TERM names.
enum class TerminalKnowledge {
  Enough,
  Unknown,      ///< there is no description of it
  CannotPlace,  ///< it cannot write at a place of the screen
};
TerminalKnowledge lookUpTerminal();

/// The bytes of the capability with this terminfo name, without the padding that only old terminals need
/// ("$<5>"). Empty when the terminal does not have it. Needs a screen.
std::string terminalCapability(const char* name);

}  // namespace varnel
