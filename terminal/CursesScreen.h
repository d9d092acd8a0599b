#pragma once

#include <termios.h>

#include <optional>
#include <string>

#include "terminal/CellGrid.h"
#include "terminal/Glyphs.h"
#include "terminal/Key.h"
#include "terminal/TerminalOutput.h"

struct screen;

namespace varnel {

/// The terminal of the program, on ncurses. It is in use from construction to destruction, and is left as it
/// was found. There can be only one.
///
/// While a terminal stands still, a signal that ends the program drops what was to be written
/// (`TerminalOutput`).
class CursesScreen final {
 public:
  /// Throws std::runtime_error with a sentence for the user when standard input or output is no terminal, or
  /// when the terminal cannot do what is needed.
  CursesScreen();
  CursesScreen(const CursesScreen&) = delete;
  CursesScreen& operator=(const CursesScreen&) = delete;
  ~CursesScreen();

  /// Gives the terminal back for a while.
  void leave();
  /// Takes it again.
  void enter();
  /// The program was stopped without a chance to leave the terminal, and goes on.
  void takeAgain();

  /// The program is about to end, and shows nothing any more. So the terminal is left even if it takes no
  /// more output.
  void prepareToEnd() { _isEnding = true; }

  /// Adapts to the present size of the terminal.
  void updateSize();
  int columns() const;
  int rows() const;
  /// What the terminal's character set has.
  const Glyphs& glyphs() const { return _hasUnicode ? unicodeGlyphs : asciiGlyphs; }

  /// Writes what differs from what the terminal shows.
  void show(const CellGrid& grid);
  /// Writes everything, since something else has written on the terminal.
  void redraw();

  /// The next key that the user has pressed; nothing when there is none.
  std::optional<Key> nextKey();
  /// True when no key can come any more: the terminal is closed.
  static bool inputHasEnded();

 private:
  void prepareColors();
  std::string waysToLeave() const;

  termios _formerMode{};
  const TerminalOutput _output;
  bool _hasUnicode;
  bool _hasColors = false;
  bool _isLeft = false;
  bool _isEnding = false;
  ::screen* _screen = nullptr;
};

/// True when standard input and standard output are terminals.
bool terminalIsThere();

}  // namespace varnel
