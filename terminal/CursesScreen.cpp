#include "terminal/CursesScreen.h"

#define NCURSES_NOMACROS
#define NCURSES_WIDECHAR 1
#include <curses.h>
#include <langinfo.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <clocale>
#include <csignal>
#include <cstdlib>
#include <cwchar>
#include <stdexcept>

#include "terminal/Capabilities.h"
#include "terminal/Characters.h"
#include "terminal/TerminalRescue.h"

namespace varnel {

namespace {

constexpr int escapeDelay = 100;  // milliseconds; longer waits are felt

struct InkColor {
  Ink ink;
  short color;
};
// Colors that can be read on a dark and on a light background.
constexpr InkColor inks[] = {
    {Ink::Mark, COLOR_CYAN}, {Ink::Change, COLOR_GREEN}, {Ink::Notice, COLOR_MAGENTA}};

short pairOf(Ink ink) { return static_cast<short>(ink); }

bool wantsColors() {
  const char* const refused = std::getenv("NO_COLOR");
  return !refused || *refused == '\0';
}

bool takesUtf8() {
  const locale_t users = ::newlocale(LC_CTYPE_MASK, "", nullptr);
  if (!users) return false;
  const bool is = std::string_view(::nl_langinfo_l(CODESET, users)) == "UTF-8";
  ::freelocale(users);
  return is;
}

[[noreturn]] void refuse(const std::string& why) {
  throw std::runtime_error(why + "; --ui text works on every terminal");
}

void checkTerminal() {
  if (!terminalIsThere())
    throw std::runtime_error(
        "--ui terminal needs a terminal as standard input and standard output; --ui text needs none");
  const char* const name = std::getenv("TERM");
  if (!name || !*name) refuse("TERM is not set, so the kind of this terminal is not known");
  const std::string named = utf8(charactersOf("TERM=" + std::string(name)));
  switch (lookUpTerminal()) {
    case TerminalKnowledge::Enough:
      return;
    case TerminalKnowledge::Unknown:
      refuse("the terminal " + named + " is not known here");
    case TerminalKnowledge::CannotPlace:
      refuse("the terminal " + named + " cannot write at a place of the screen");
  }
}

struct NamedKey {
  int code;
  Key::Kind kind;
};
constexpr NamedKey namedKeys[] = {
    {KEY_UP, Key::Kind::Up},           {KEY_DOWN, Key::Kind::Down},
    {KEY_LEFT, Key::Kind::Left},       {KEY_RIGHT, Key::Kind::Right},
    {KEY_SLEFT, Key::Kind::ShiftLeft}, {KEY_SRIGHT, Key::Kind::ShiftRight},
    {KEY_HOME, Key::Kind::Home},       {KEY_A1, Key::Kind::Home},
    {KEY_END, Key::Kind::End},         {KEY_C1, Key::Kind::End},
    {KEY_PPAGE, Key::Kind::PageUp},    {KEY_A3, Key::Kind::PageUp},
    {KEY_NPAGE, Key::Kind::PageDown},  {KEY_C3, Key::Kind::PageDown},
    {KEY_ENTER, Key::Kind::Enter},     {KEY_BACKSPACE, Key::Kind::Backspace},
    {KEY_DC, Key::Kind::Delete},       {KEY_BTAB, Key::Kind::BackTab},
    {KEY_F(1), Key::Kind::Help},
};

std::optional<Key> mouseKey() {
  MEVENT event{};
  if (::getmouse(&event) != OK) return std::nullopt;
  Key key;
  key.column = event.x;
  key.row = event.y;
  if ((event.bstate & BUTTON4_PRESSED) != 0) {
    key.kind = Key::Kind::WheelUp;
  } else if ((event.bstate & BUTTON5_PRESSED) != 0) {
    key.kind = Key::Kind::WheelDown;
  } else if ((event.bstate & BUTTON1_PRESSED) != 0) {
    key.kind = Key::Kind::Click;
  } else {
    return std::nullopt;
  }
  return key;
}

std::optional<Key> codedKey(int code) {
  if (code == KEY_MOUSE) return mouseKey();
  const auto* const found = std::ranges::find(namedKeys, code, &NamedKey::code);
  if (found == std::end(namedKeys)) return std::nullopt;
  return Key{found->kind};
}

std::optional<Key> typedKey(wchar_t character) {
  constexpr wchar_t escape = 0x1B, deleted = 0x7F, lastControl = 0x1F;
  switch (character) {
    case escape:
      return Key{Key::Kind::Escape};
    case L'\r':
    case L'\n':
      return Key{Key::Kind::Enter};
    case L'\t':
      return Key{Key::Kind::Tab};
    case L'\b':
    case deleted:
      return Key{Key::Kind::Backspace};
    default:
      break;
  }
  if (character == 0) return std::nullopt;
  if (character <= lastControl) return Key::control(static_cast<wchar_t>(character + 0x60));
  if (charactersOf(utf8({&character, 1}))[0] != character) return std::nullopt;  // it would bend the line
  return Key::of(character);
}

void doNothing(int) {}

// A signal that has its usual effect gets a handler that ncurses leaves alone. Otherwise ncurses would end
// the program by itself, without what else there is to do, and would drop a SIGTSTP that comes while it
// writes.
class SignalsFromNcurses {
 public:
  SignalsFromNcurses() { exchange(SIG_DFL, doNothing); }
  SignalsFromNcurses(const SignalsFromNcurses&) = delete;
  SignalsFromNcurses& operator=(const SignalsFromNcurses&) = delete;
  ~SignalsFromNcurses() { exchange(doNothing, SIG_DFL); }

 private:
  static void exchange(sighandler_t former, sighandler_t next) {
    for (const int signal : {SIGINT, SIGTERM, SIGTSTP, SIGWINCH}) {
      struct sigaction action {};
      if (::sigaction(signal, nullptr, &action) == 0 && action.sa_handler == former)
        std::signal(signal, next);
    }
  }
};

}  // namespace

bool terminalIsThere() { return ::isatty(STDIN_FILENO) == 1 && ::isatty(STDOUT_FILENO) == 1; }

CursesScreen::CursesScreen() : _hasUnicode(takesUtf8()) {
  checkTerminal();
  useUtf8Characters();
  ::tcgetattr(STDIN_FILENO, &_formerMode);
  const TerminalOutput::Writing writing(_output);
  if (!std::getenv("ESCDELAY")) ::set_escdelay(escapeDelay);
  {
    const SignalsFromNcurses kept;
    _screen = ::newterm(nullptr, stdout, stdin);
  }
  if (!_screen) refuse("the terminal cannot be used");
  TerminalRescue::arm(_formerMode, waysToLeave());
  ::raw();
  ::noecho();
  ::nonl();
  ::keypad(stdscr, TRUE);
  ::nodelay(stdscr, TRUE);
  ::leaveok(stdscr, TRUE);
  ::curs_set(0);
  prepareColors();
  ::mouseinterval(0);
  ::mousemask(BUTTON1_PRESSED | BUTTON4_PRESSED | BUTTON5_PRESSED, nullptr);
}

CursesScreen::~CursesScreen() {
  leave();
  ::delscreen(_screen);
}

void CursesScreen::prepareColors() {
  _hasColors = wantsColors() && ::has_colors() && ::start_color() == OK;
  if (!_hasColors) return;
  const short background =
      ::use_default_colors() == OK ? static_cast<short>(-1) : static_cast<short>(COLOR_BLACK);
  for (const auto& [ink, color] : inks) ::init_pair(pairOf(ink), color, background);
}

std::string CursesScreen::waysToLeave() const {
  std::string bytes;
  if (!terminalCapability("kmous").empty()) bytes += "\x1b[?1006l\x1b[?1000l";
  bytes += terminalCapability("sgr0") + terminalCapability("cnorm") + terminalCapability("rmkx");
  const std::string leaving = terminalCapability("rmcup");
  return bytes + (leaving.empty() ? "\r\n" : leaving);
}

void CursesScreen::leave() {
  if (_isLeft) return;
  _isLeft = true;
  // A program in the background leaves the terminal too, instead of being stopped.
  sigset_t stop;
  sigset_t former;
  ::sigemptyset(&stop);
  ::sigaddset(&stop, SIGTTOU);
  ::pthread_sigmask(SIG_BLOCK, &stop, &former);
  {
    const TerminalOutput::Writing writing(_output);
    if (_isEnding) _output.makeRoomToEnd();
    ::curs_set(1);
    ::endwin();
  }
  if (_isEnding) _output.dropTheRest();
  // What the mouse has sent meanwhile must not reach the shell.
  ::tcflush(STDIN_FILENO, TCIFLUSH);
  ::tcsetattr(STDIN_FILENO, TCSANOW, &_formerMode);
  ::pthread_sigmask(SIG_SETMASK, &former, nullptr);
  TerminalRescue::disarm();
}

void CursesScreen::enter() {
  // The shell may have changed the mode meanwhile.
  ::tcgetattr(STDIN_FILENO, &_formerMode);
  ::def_shell_mode();
  TerminalRescue::arm(_formerMode, waysToLeave());
  _isLeft = false;
  const TerminalOutput::Writing writing(_output);
  ::reset_prog_mode();
  // This takes the screen again, with the keys, the cursor, and the mouse as they were.
  ::refresh();
  ::curs_set(0);
  updateSize();
  redraw();
}

void CursesScreen::takeAgain() {
  if (_isLeft) return;
  ::reset_prog_mode();
  updateSize();
  redraw();
}

void CursesScreen::updateSize() {
  winsize size{};
  if (::ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) != 0 || size.ws_row == 0 || size.ws_col == 0) return;
  ::resizeterm(size.ws_row, size.ws_col);
}

int CursesScreen::columns() const { return getmaxx(::stdscr); }
int CursesScreen::rows() const { return getmaxy(::stdscr); }

void CursesScreen::show(const CellGrid& grid) {
  if (_isLeft || _isEnding) return;
  const TerminalOutput::Writing writing(_output);
  for (int row = 0; row < std::min(grid.rows(), rows()); ++row) {
    for (int column = 0; column < std::min(grid.columns(), columns()); ++column) {
      const GridCell& cell = grid.at(column, row);
      std::wstring text = cell.text;
      if (!_hasUnicode && (text.empty() || text[0] > 0x7E)) text = text.empty() ? L" " : L"?";
      if (text.empty()) continue;  // the second half of a wide character
      if (::wcwidth(text[0]) < 0) text = L"\uFFFD";
      attr_t attributes = A_NORMAL;
      if (cell.look.isBold) attributes |= A_BOLD;
      if (cell.look.isReversed) attributes |= A_REVERSE;
      cchar_t shown{};
      ::setcchar(&shown, text.c_str(), attributes, _hasColors ? pairOf(cell.look.ink) : short{0}, nullptr);
      ::mvadd_wch(row, column, &shown);
    }
  }
  ::leaveok(stdscr, grid.hasCursor() ? FALSE : TRUE);
  ::curs_set(grid.hasCursor() ? 1 : 0);
  if (grid.hasCursor()) ::move(grid.cursorRow(), grid.cursorColumn());
  ::refresh();
}

void CursesScreen::redraw() { ::clearok(stdscr, TRUE); }

std::optional<Key> CursesScreen::nextKey() {
  if (_isLeft) return std::nullopt;
  const TerminalOutput::Writing writing(_output);  // this can draw too
  for (;;) {
    wint_t typed = 0;
    const int kind = ::get_wch(&typed);
    if (kind == ERR) return std::nullopt;
    const auto key =
        kind == KEY_CODE_YES ? codedKey(static_cast<int>(typed)) : typedKey(static_cast<wchar_t>(typed));
    if (key) return key;
  }
}

bool CursesScreen::inputHasEnded() {
  pollfd input{STDIN_FILENO, POLLIN, 0};
  if (::poll(&input, 1, 0) <= 0) return false;
  if ((input.revents & (POLLHUP | POLLERR | POLLNVAL)) != 0) return true;
  int waiting = 0;
  return ::ioctl(STDIN_FILENO, FIONREAD, &waiting) == 0 && waiting == 0;
}

}  // namespace varnel
