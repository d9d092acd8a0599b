#include "programs/varnel/TerminalView.h"

#include <pthread.h>
#include <unistd.h>

#include <QSocketNotifier>
#include <algorithm>
#include <atomic>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <initializer_list>
#include <iostream>
#include <optional>

#include "app/DateFormatter.h"
#include "app/RowAnswers.h"
#include "app/ValueHistory.h"
#include "app/VarnelApp.h"
#include "host/HostApplication.h"
#include "host/SignalWatcher.h"
#include "programs/varnel/HostServices.h"
#include "programs/varnel/PlayedFile.h"
#include "terminal/CursesScreen.h"
#include "terminal/HeldLines.h"
#include "terminal/TerminalUserInterface.h"

namespace varnel {

namespace {

constexpr std::chrono::seconds intervalOfTrimming(10);

// Stops the process until somebody continues it. A process that nobody could continue is not stopped.
void stopHere() {
  sigset_t stop;
  ::sigemptyset(&stop);
  ::sigaddset(&stop, SIGTSTP);
  ::raise(SIGTSTP);  // still blocked
  ::pthread_sigmask(SIG_UNBLOCK, &stop, nullptr);
  ::pthread_sigmask(SIG_BLOCK, &stop, nullptr);
}

bool isPending(std::initializer_list<int> signals) {
  sigset_t pending;
  ::sigpending(&pending);
  return std::ranges::any_of(signals, [&](int signal) { return ::sigismember(&pending, signal) == 1; });
}

// Another job of the shell has the terminal: who touches it is stopped.
bool isInBackground() {
  const pid_t foreground = ::tcgetpgrp(STDIN_FILENO);
  return foreground >= 0 && foreground != ::getpgrp();
}

std::atomic<bool> wasContinued;

// Signals still have their usual effect, so that the shell can end the program. Returns also when nobody
// could continue it.
void waitForForeground() {
  struct sigaction action {};
  struct sigaction former {};
  action.sa_handler = [](int) { wasContinued = true; };
  ::sigemptyset(&action.sa_mask);
  ::sigaction(SIGCONT, &action, &former);
  do {
    wasContinued = false;
    if (isInBackground()) ::raise(SIGTTOU);
  } while (wasContinued);
  ::sigaction(SIGCONT, &former, nullptr);
}

std::string timeOfDay(Time time) {
  const SystemClock clock;
  return DateFormatter("HH:mm:ss").string(time, clock.zoneAt(time));
}

std::optional<CourseColumns> courseColumns(const ValueHistory& history, ValueHistory::Number number,
                                           const std::string& name, std::chrono::minutes length,
                                           int columns) {
  if (!history.has(number)) return std::nullopt;
  const auto stretch = history.last(length);
  CourseColumns course;
  course.name = name;
  course.unit = history.unit(number);
  const auto summary = history.summary(number, stretch);
  course.decimals = summary.decimals;
  const int decimals = static_cast<int>(summary.decimals);
  char text[160];
  std::snprintf(text, sizeof text, "now %.*f   lowest %.*f   mean %.*f   highest %.*f", decimals,
                summary.last, decimals, summary.lowest, decimals + 1, summary.mean, decimals,
                summary.highest);
  course.summary = text;
  course.begin = timeOfDay(history.timeAt(stretch.begin));
  course.end = timeOfDay(history.timeAt(stretch.end));
  for (const auto& column : history.columns(number, stretch, static_cast<std::size_t>(columns))) {
    if (column.isEmpty) {
      course.columns.emplace_back();
    } else {
      course.columns.emplace_back(CourseColumns::Range{column.lowest, column.highest});
    }
  }
  return course;
}

/// The viewer on a terminal, from start to end.
class TerminalViewer final {
 public:
  TerminalViewer(HostApplication& host, const Options& options, const ApplicationInfo& application)
      : _host(host),
        _watcher({SIGINT, SIGTERM, SIGHUP, SIGUSR1, SIGUSR2, SIGWINCH, SIGTSTP, SIGCONT},
                 [this](int signal) { take(signal); }),
        _services(options, application),
        _file(options, _services),
        _screen(std::in_place),
        _userInterface(
            _services.queue(),
            {.close = [this] { _host.end(0); },
             .startOver = [this] { startOver(); },
             .save = [this] { _app.save(); },
             .find = [this](const std::string& words) { return found(words); },
             .goTo = [this](const FoundRow& row) { _app.goTo(row.path); },
             .explain = [this](const std::vector<std::string>& path) { return explained(path); },
             .course = [this](const std::vector<std::string>& path) { return courseOf(path); },
             .heldLines = [this] { return heldLines(); },
             .suspend = [] { ::kill(0, SIGTSTP); },
             .redraw = [this] { _screen->redraw(); }},
            [this](const CellGrid& grid) { _screen->show(grid); }, _screen->glyphs()),
        _answers(_services.model().generator.resources, _services.model().generator.clock, _history),
        _app({.model = _services.model(_held.lines()),
              .files = _services.files(),
              .preferences = _services.preferences(),
              .userInterface = _userInterface,
              .wayToStartOver = "press R",
              .history = &_history,
              .usersClock = &_services.clock()}),
        _input(STDIN_FILENO, QSocketNotifier::Read),
        _trimming(_services.queue().repeating(intervalOfTrimming, [this] { _held.trim(); })) {
    QObject::connect(&_input, &QSocketNotifier::activated, &_input, [this] { takeKeys(); });
    if (options.updates) _app.afterUpdates(*options.updates, [this] { _host.end(0); });
  }

  int run() {
    _userInterface.resize(_screen->columns(), _screen->rows());
    _app.applicationDidFinishLaunching();
    if (!_file.displays().empty()) showSaved();
    const int status = _host.run();
    _app.applicationWillTerminate();
    _screen.reset();
    if (_hasLostTerminal) std::cerr << programName << ": the terminal is closed\n";
    return status;
  }

 private:
  void startOver() {
    if (!_file.displays().empty()) return showSaved();
    _file.startOver();
    _app.startOver();
  }
  // The last display of the snapshot.
  void showSaved() {
    const Generation& saved = _file.displays().back();
    _app.showDisplay(saved.display, statusOfSaved(saved.time),
                     formatsOfSaved(saved.display, _services.model().generator));
  }

  void take(int signal) {
    switch (signal) {
      case SIGUSR1:
        return startOver();
      case SIGUSR2:
        return _app.save();
      case SIGWINCH:
        return adaptSize();
      case SIGTSTP:
        return suspend();
      case SIGCONT:
        if (!waitForTerminal()) return;
        _screen->takeAgain();
        return adaptSize();
      default:
        _isEnding = true;
        _screen->prepareToEnd();
        _host.end(0);
    }
  }

  std::vector<FoundRow> found(const std::string& words) const {
    std::vector<FoundRow> rows;
    for (auto& node : _app.find(words)) rows.push_back({std::move(node.path), std::move(node.value)});
    return rows;
  }

  CoursePage::Source courseOf(const NamePath& path) const {
    const VarnelModelNode* const node = path.empty() ? nullptr : _app.nodeAt(path);
    const auto course = node ? _answers.course(*node, path) : std::nullopt;
    if (!course) return {};
    return [this, course = *course](std::chrono::minutes length, int columns) {
      return courseColumns(_history, course.number, course.title, length, columns);
    };
  }

  std::string heldLines() const {
    const std::string lines = _held.last();
    return lines.empty() ? "There are no lines. --log-level N brings log lines of priority N and below.\n"
                         : lines;
  }

  std::string explained(const NamePath& path) const {
    const VarnelModelNode* const node = path.empty() ? nullptr : _app.nodeAt(path);
    return node ? _answers.everything(*node, path) : std::string();
  }

  void takeKeys() noexcept {
    bool isAny = false;
    while (const auto key = _screen->nextKey()) {
      isAny = true;
      _userInterface.take(*key);
    }
    if (isAny || !CursesScreen::inputHasEnded()) return;
    _input.setEnabled(false);
    _hasLostTerminal = true;
    _host.end(EXIT_FAILURE);
  }

  void adaptSize() {
    _screen->updateSize();
    _userInterface.resize(_screen->columns(), _screen->rows());
  }

  // Stays stopped while another job has the terminal. False when the program ends instead.
  bool waitForTerminal() {
    for (;;) {
      if (_isEnding || isPending({SIGTERM, SIGHUP, SIGINT})) return false;
      if (!isInBackground()) return true;
      stopHere();
      if (isPending({SIGCONT, SIGTERM, SIGHUP, SIGINT})) continue;
      // Nobody could continue it, so it was not stopped, and the terminal does not come back.
      _isEnding = _hasLostTerminal = true;
      _host.end(EXIT_FAILURE);
      return false;
    }
  }

  void suspend() {
    if (_isEnding) return;
    _screen->leave();
    stopHere();
    if (!waitForTerminal()) return;
    _screen->enter();
    adaptSize();
  }

  HostApplication& _host;
  const SignalWatcher _watcher;  // before the screen: a signal must not end the program while it is in use
  HeldLines _held;
  HostServices _services;
  PlayedFile _file;
  std::optional<CursesScreen> _screen;
  TerminalUserInterface _userInterface;
  ValueHistory _history;
  RowAnswers _answers;
  VarnelApp _app;
  QSocketNotifier _input;
  std::unique_ptr<RepeatingTimer> _trimming;
  bool _hasLostTerminal = false;
  bool _isEnding = false;
};

}  // namespace

int viewInTerminal(int& argumentCount, char** arguments, const Options& options,
                   const ApplicationInfo& application) {
  waitForForeground();
  HostApplication host(argumentCount, arguments);
  TerminalViewer viewer(host, options, application);
  return viewer.run();
}

}  // namespace varnel
