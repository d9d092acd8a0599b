#include "programs/varnel/TextView.h"

#include <cctype>
#include <csignal>

#include "app/TextViewer.h"
#include "host/HostApplication.h"
#include "host/KeyWatcher.h"
#include "host/SignalWatcher.h"
#include "programs/varnel/HostServices.h"
#include "programs/varnel/StandardOutput.h"

namespace varnel {

int viewAsText(int& argumentCount, char** arguments, const Options& options,
               const ApplicationInfo& application) {
  HostApplication host(argumentCount, arguments);
  HostServices services(options, application);
  StandardOutput output;

  TextViewer viewer(services.model(), services.files(), output);
  if (options.updates) viewer.afterUpdates(*options.updates, [&host] { host.end(0); });
  const SignalWatcher watcher({SIGINT, SIGTERM, SIGHUP, SIGUSR1, SIGUSR2}, [&](int signal) {
    switch (signal) {
      case SIGUSR1:
        viewer.startOver();
        break;
      case SIGUSR2:
        viewer.save();
        break;
      default:
        host.end(0);
    }
  });
  const KeyWatcher keys([&](char key) {
    switch (std::toupper(static_cast<unsigned char>(key))) {
      case 'R':
        viewer.startOver();
        break;
      case 'S':
        viewer.save();
        break;
      case 'Q':
        host.end(0);
    }
  });
  return host.run();
}

}  // namespace varnel
