#include "programs/varnel/StandardOutput.h"

#include <poll.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <string_view>
#include <utility>

namespace varnel {

namespace {

// ECMA-48 control sequences.
constexpr std::string_view clearScreen = "\x1b[H\x1b[2J";
constexpr std::string_view toTopLeft = "\x1b[H";
constexpr std::string_view clearRestOfLine = "\x1b[K";
constexpr std::string_view clearBelow = "\x1b[J";

constexpr std::size_t mostWaiting = 4096;

// Waits when standard output takes no more at once. Returns 0, or the system's error.
int writeAll(std::string_view text) {
  while (!text.empty()) {
    const ssize_t written = ::write(STDOUT_FILENO, text.data(), text.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0 && errno == EAGAIN) {
      pollfd room{STDOUT_FILENO, POLLOUT, 0};
      ::poll(&room, 1, -1);
      continue;
    }
    if (written <= 0) return written < 0 ? errno : EIO;
    text.remove_prefix(static_cast<std::size_t>(written));
  }
  return 0;
}

bool isPipe(int descriptor) {
  struct stat status {};
  return ::fstat(descriptor, &status) == 0 && (S_ISFIFO(status.st_mode) || S_ISSOCK(status.st_mode));
}

bool readerHasLeft() {
  pollfd output{STDOUT_FILENO, 0, 0};
  return ::poll(&output, 1, 0) == 1 && (output.revents & (POLLERR | POLLHUP)) != 0;
}

// The first characters of the line, as many as there are columns. UTF-8 sequences stay whole.
std::string_view cut(std::string_view line, std::size_t columns) {
  std::size_t characters = 0;
  for (std::size_t i = 0; i < line.size(); ++i) {
    if ((line[i] & 0xC0) != 0x80 && ++characters > columns) return line.substr(0, i);
  }
  return line;
}

// The text with each of its lines broken to the width, since users must be able to read all of it.
std::string wrapped(std::string_view text, std::size_t columns) {
  std::string lines;
  while (!text.empty()) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    std::string_view line = text.substr(0, end);
    do {
      std::string_view part = cut(line, columns);
      const std::size_t blank = part.rfind(' ');
      if (part.size() < line.size() && line[part.size()] != ' ' && blank != std::string_view::npos)
        part = part.substr(0, blank);
      lines.append(part).push_back('\n');
      line.remove_prefix(part.size());
      if (line.starts_with(' ')) line.remove_prefix(1);
    } while (!line.empty());
    text.remove_prefix(std::min(end + 1, text.size()));
  }
  return lines;
}

std::string fitted(const TextPage& wholePage, std::size_t rows, std::size_t columns) {
  TextPage head = wholePage;
  head.tree.clear();
  const std::string text = wrapped(head.text(), columns) + wholePage.tree;
  std::string_view page = text;
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

std::streamsize StandardOutput::LineBuffer::xsputn(const char* text, std::streamsize count) {
  _output.add({text, static_cast<std::size_t>(count)});
  return count;
}

int StandardOutput::LineBuffer::overflow(int character) {
  if (character == traits_type::eof()) return traits_type::not_eof(character);
  const char text = traits_type::to_char_type(character);
  _output.add({&text, 1});
  return character;
}

StandardOutput::StandardOutput() : _isTerminal(::isatty(STDOUT_FILENO) == 1) {}

StandardOutput::~StandardOutput() {
  _endHandler = nullptr;
  write(_isTerminal && _hasShown ? '\n' + _waiting : _waiting);
}

void StandardOutput::setEndHandler(std::function<void(int error)> handler) {
  _endHandler = std::move(handler);
  if (!isPipe(STDOUT_FILENO)) return;
  // Nothing is ever read here. The notifier wakes when nobody reads the other end any more.
  _reader = std::make_unique<QSocketNotifier>(STDOUT_FILENO, QSocketNotifier::Read);
  QObject::connect(_reader.get(), &QSocketNotifier::activated, _reader.get(), [this] {
    if (readerHasLeft()) {
      end(0);
    } else {
      _reader->setEnabled(false);  // a socket with unread bytes would wake it again and again
    }
  });
}

void StandardOutput::end(int error) {
  if (_reader) _reader->setEnabled(false);
  if (const auto handler = std::exchange(_endHandler, nullptr)) handler(error);
}

void StandardOutput::write(std::string_view text) {
  if (const int error = writeAll(text); error != 0) end(error == EPIPE ? 0 : error);
}

void StandardOutput::add(std::string_view text) {
  _waiting += text;
  if (!_waiting.ends_with('\n')) return;
  if (!_isTerminal) return write(std::exchange(_waiting, {}));
  if (_waiting.size() > mostWaiting) showAgain();
}

void StandardOutput::show(const TextPage& page) {
  _page = page;
  const std::string lines = std::exchange(_waiting, {});
  winsize size{};
  const bool hasSize = ::ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_row > 1 && size.ws_col > 0;
  std::string text;
  // A terminal gets the lines too; the page that follows at once replaces them.
  if (_isTerminal && (!_hasShown || !lines.empty())) text += clearScreen;
  text += lines;
  text += _isTerminal && hasSize ? fitted(page, size.ws_row, size.ws_col) : page.text();
  _hasShown = true;
  write(text);
}

void StandardOutput::showAgain() {
  if (_isTerminal && _hasShown) show(TextPage(_page));
}

}  // namespace varnel
