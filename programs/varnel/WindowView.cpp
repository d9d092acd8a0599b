#include "programs/varnel/WindowView.h"

#include <QToolTip>
#include <csignal>

#include "app/EventHistory.h"
#include "app/RowAnswers.h"
#include "app/ValueHistory.h"
#include "app/VarnelApp.h"
#include "host/SignalWatcher.h"
#include "host/StateFolder.h"
#include "programs/varnel/CaptureCourses.h"
#include "programs/varnel/HistoryTrends.h"
#include "programs/varnel/HostServices.h"
#include "programs/varnel/Player.h"
#include "programs/varnel/RowCommands.h"
#include "programs/varnel/Trends.h"
#include "widgets/RowMenu.h"
#include "widgets/WidgetApplication.h"
#include "widgets/WidgetUserInterface.h"

namespace varnel {

namespace {

/// The viewer in a window, from start to end.
class WindowViewer final {
 public:
  WindowViewer(WidgetApplication& host, const Options& options, const ApplicationInfo& application)
      : _host(host),
        _services(options, application),
        _userInterface({.close = [this] { _host.end(0); }, .startOver = [this] { _player.startOver(); }},
                       RememberedSize(stateFolder())),
        _answers(_services.model().generator.resources, _services.model().generator.clock, _history),
        _liveTrends({.numbers = _history,
                     .events = _events,
                     .name = [this] { return _app.technology(); },
                     .clock = &_services.clock(),
                     .input = [this] { return _player.openFile(); }}),
        _trends({.live = _liveTrends,
                 .keyOf = [this](const NamePath& path) { return keyOf(path); },
                 .tellFailure =
                     [this](const std::string& why) {
                       _userInterface.showAlert({"No Trends", why, "OK"});
                     }}),
        _courses(
            {.displays = _history,
             .clock = _services.playedClock(),
             .capture =
                 [this] {
                   const CaptureHistory* const capture = _trends.capture();
                   if (!capture || capture->isEmpty()) return std::optional<CaptureCourses::Capture>();
                   return std::optional(CaptureCourses::Capture{&capture->numbers(), !capture->isReading()});
                 }}),
        _app({.model = _services.model(),
              .files = _services.files(),
              .preferences = _services.preferences(),
              .userInterface = _userInterface,
              .history = &_history,
              .events = &_events,
              .answers = &_answers,
              .courses = &_courses,
              .usersClock = &_services.clock()}),
        _rowCommands(_app, _answers),
        _player({_services, _app, _userInterface, options,
                 [this, &options](const auto& capture) { showCourses(capture, options); },
                 [this](const auto& saved) { showCourses(saved); }}),
        _watcher({SIGINT, SIGTERM, SIGHUP, SIGUSR1, SIGUSR2}, [this](int signal) { take(signal); }) {
    _userInterface.setRecordSource({[this](const NamePath& list) { return _app.hasRecordsAt(list); },
                                    [this](const NamePath& list) { return _app.recordsAt(list); }});
    _userInterface.setWindowObserver([this](WindowWidget& window) { furnish(window); });
    _app.observeDisplay([this] { _trends.refresh(); });
    if (options.updates) _app.afterUpdates(*options.updates, [this] { _host.end(0); });
  }

  int run() {
    _app.applicationDidFinishLaunching();
    _player.begin();
    const int status = _host.run();
    _app.applicationWillTerminate();
    return status;
  }

 private:
  void take(int signal) {
    switch (signal) {
      case SIGUSR1:
        return _player.startOver();
      case SIGUSR2:
        return _app.save();
      default:
        _host.end(0);
    }
  }

  // What the user can do in the window beyond the screens of the application.
  void furnish(WindowWidget& window) {
    _rowCommands.addTo(window);
    const QAction& table = window.addCommand(
        QObject::tr("Show a list as a table, or as rows again"), {Qt::CTRL | Qt::Key_T}, [&window] {
          if (window.page() || !window.stack() || window.stack()->toggleRecordTable()) return;
          QToolTip::showText(placeOfFocus(window), QObject::tr("Only a list can be shown as a table"),
                             &window);
        });
    window.offerOnlyIf(table, [&window] { return window.stack() && window.stack()->offersRecordTable(); });
    _trends.furnish(window);
    _player.furnish(window);
  }

  // The courses are those of the capture that is played, if there is one.
  void showCourses(const std::optional<Player::Capture>& capture, const Options& options) {
    if (!capture) return _trends.closeFile();
    _trends.openCapture({.path = capture->path,
                         .technology = capture->technology.value_or(""),
                         .subscription = options.subscription,
                         .playedTime = [this] { return _player.playedTime(); }});
  }

  // The courses are those over the displays of the snapshot.
  void showCourses(const Player::Saved& saved) {
    _trends.openSaved({.path = saved.path,
                       .displays = saved.displays,
                       .formats = saved.formats,
                       .clock = &_services.clock(),
                       .shownTime = [this] { return _player.savedTime(); }});
  }

  // The key of the row's number in the history.
  std::optional<std::string> keyOf(const NamePath& path) const {
    const VarnelModelNode* const row = _app.nodeAt(path);
    const auto series = row ? _history.seriesOf(*row) : std::nullopt;
    return series ? std::optional(std::string(_history.key(*series))) : std::nullopt;
  }

  WidgetApplication& _host;
  HostServices _services;
  WidgetUserInterface _userInterface;
  ValueHistory _history;
  EventHistory _events;
  RowAnswers _answers;
  HistoryTrends _liveTrends;
  Trends _trends;
  CaptureCourses _courses;
  VarnelApp _app;
  RowCommands _rowCommands;
  Player _player;
  const SignalWatcher _watcher;
};

}  // namespace

int viewInWindow(int& argumentCount, char** arguments, const Options& options,
                 const ApplicationInfo& application) {
  WidgetApplication host(argumentCount, arguments);
  WindowViewer viewer(host, options, application);
  return viewer.run();
}

}  // namespace varnel
