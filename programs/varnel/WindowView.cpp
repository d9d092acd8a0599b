#include "programs/varnel/WindowView.h"

#include <csignal>

#include "app/VarnelApp.h"
#include "host/SignalWatcher.h"
#include "host/StateFolder.h"
#include "programs/varnel/HostServices.h"
#include "widgets/WidgetApplication.h"
#include "widgets/WidgetUserInterface.h"

namespace varnel {

int viewInWindow(int& argumentCount, char** arguments, const Options& options,
                 const ApplicationInfo& application) {
  WidgetApplication host(argumentCount, arguments);
  HostServices services(options, application);
  VarnelApp* viewer = nullptr;
  WidgetUserInterface userInterface(
      {.close = [&host] { host.end(0); }, .startOver = [&viewer] { viewer->startOver(); }},
      RememberedSize(stateFolder()));
  VarnelApp app({services.model(), services.files(), services.preferences(), userInterface});
  viewer = &app;
  if (options.updates) app.afterUpdates(*options.updates, [&host] { host.end(0); });
  const SignalWatcher watcher({SIGINT, SIGTERM, SIGHUP, SIGUSR1, SIGUSR2}, [&](int signal) {
    switch (signal) {
      case SIGUSR1:
        app.startOver();
        break;
      case SIGUSR2:
        app.save();
        break;
      default:
        host.end(0);
    }
  });
  app.applicationDidFinishLaunching();
  const int status = host.run();
  app.applicationWillTerminate();
  return status;
}

}  // namespace varnel
