#include "terminal/Capabilities.h"

#include <unistd.h>

// They define macros of many ordinary words, so they come last and only here.
#include <curses.h>
#include <term.h>

namespace varnel {

std::string terminalCapability(const char* name) {
  const char* const found = ::tigetstr(const_cast<char*>(name));
  if (!found || found == reinterpret_cast<char*>(-1)) return {};
  std::string text(found);
  for (std::size_t at; (at = text.find("$<")) != std::string::npos;) {
    const std::size_t end = text.find('>', at);
    text.erase(at, end == std::string::npos ? end : end - at + 1);
  }
  return text;
}

TerminalKnowledge lookUpTerminal() {
  int found = 0;
  if (::setupterm(nullptr, STDOUT_FILENO, &found) != OK || found != 1) return TerminalKnowledge::Unknown;
  const bool canPlace = !terminalCapability("cup").empty();
  ::del_curterm(cur_term);
  return canPlace ? TerminalKnowledge::Enough : TerminalKnowledge::CannotPlace;
}

}  // namespace varnel
