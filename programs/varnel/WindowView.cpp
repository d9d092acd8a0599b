#include "programs/varnel/WindowView.h"

#include <csignal>

#include "app/RowAnswers.h"
#include "app/ValueHistory.h"
#include "app/VarnelApp.h"
#include "host/SignalWatcher.h"
#include "host/StateFolder.h"
#include "programs/varnel/HostServices.h"
#include "programs/varnel/PlayedFile.h"
#include "programs/varnel/RowCommands.h"
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
        _file(options, _services),
        _userInterface({.close = [this] { _host.end(0); }, .startOver = [this] { _app.startOver(); }},
                       RememberedSize(stateFolder())),
        _answers(_services.model().generator.resources, _services.model().generator.clock, _history),
        _app({.model = _services.model(),
              .files = _services.files(),
              .preferences = _services.preferences(),
              .userInterface = _userInterface,
              .history = &_history}),
        _rowCommands(_app, _answers),
        _watcher({SIGINT, SIGTERM, SIGHUP, SIGUSR1, SIGUSR2}, [this](int signal) { take(signal); }) {
    _userInterface.setRecordSource({[this](const NamePath& list) { return _app.hasRecordsAt(list); },
                                    [this](const NamePath& list) { return _app.recordsAt(list); }});
    _userInterface.setWindowObserver([this](WindowWidget& window) { furnish(window); });
    if (options.updates) _app.afterUpdates(*options.updates, [this] { _host.end(0); });
  }

  int run() {
    _app.applicationDidFinishLaunching();
    const int status = _host.run();
    _app.applicationWillTerminate();
    return status;
  }

 private:
  void take(int signal) {
    switch (signal) {
      case SIGUSR1:
        return _app.startOver();
      case SIGUSR2:
        return _app.save();
      default:
        _host.end(0);
    }
  }

  // What the user can do in the window beyond the screens of the application.
  void furnish(WindowWidget& window) {
    _rowCommands.addTo(window);
    window.addCommand(QObject::tr("Show a list as a table, or as rows again"), {Qt::CTRL | Qt::Key_T},
                      [&window] {
                        if (!window.page() && window.stack()) window.stack()->toggleRecordTable();
                      });
  }

  WidgetApplication& _host;
  HostServices _services;
  const PlayedFile _file;
  WidgetUserInterface _userInterface;
  ValueHistory _history;
  RowAnswers _answers;
  VarnelApp _app;
  RowCommands _rowCommands;
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
