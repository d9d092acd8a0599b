#include "programs/varnel/StandardOutput.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <string_view>

#include "base/Log.h"

namespace varnel {

namespace {

// ECMA-48 control sequences.
constexpr std::string_view clearScreen = "\x1b[H\x1b[2J";
constexpr std::string_view toTopLeft = "\x1b[H";
constexpr std::string_view clearRestOfLine = "\x1b[K";
constexpr std::string_view clearBelow = "\x1b[J";

void writeAll(std::string_view text) {
  while (!text.empty()) {
    const ssize_t written = ::write(STDOUT_FILENO, text.data(), text.size());
    if (written < 0 && errno == EINTR) continue;
    if (written <= 0) {
      logError("Could not write to standard output");
      return;
    }
    text.remove_prefix(static_cast<std::size_t>(written));
  }
}

// The line's first characters, as many as there are columns; UTF-8 sequences stay whole.
std::string_view cut(std::string_view line, std::size_t columns) {
  std::size_t characters = 0;
  for (std::size_t i = 0; i < line.size(); ++i) {
    if ((line[i] & 0xC0) != 0x80 && ++characters > columns) return line.substr(0, i);
  }
  return line;
}

std::string fitted(std::string_view page, std::size_t rows, std::size_t columns) {
  const auto lines = static_cast<std::size_t>(std::ranges::count(page, '\n'));
  const std::size_t shown = lines <= rows ? lines : rows - 1;
  std::string screen(toTopLeft);
  for (std::size_t line = 0; line < shown; ++line) {
    const std::size_t end = page.find('\n');
    if (line > 0) screen += "\r\n";
    screen.append(cut(page.substr(0, end), columns)).append(clearRestOfLine);
    page.remove_prefix(end + 1);
  }
  if (shown < lines) {
    const std::string rest = "… " + std::to_string(lines - shown) + " more lines";
    screen.append("\r\n").append(cut(rest, columns)).append(clearRestOfLine);
  }
  return screen.append(clearBelow);
}

}  // namespace

StandardOutput::StandardOutput() : _isTerminal(::isatty(STDOUT_FILENO) == 1) {
  if (_isTerminal) writeAll(clearScreen);
}

StandardOutput::~StandardOutput() {
  if (_isTerminal) writeAll("\n");
}

void StandardOutput::show(const std::string& page) {
  winsize size{};
  const bool hasSize = ::ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_row > 1 && size.ws_col > 0;
  writeAll(_isTerminal && hasSize ? fitted(page, size.ws_row, size.ws_col) : page);
}

}  // namespace varnel
