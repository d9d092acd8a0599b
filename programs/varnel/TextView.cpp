#include "programs/varnel/TextView.h"

#include <cctype>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <optional>

#include "app/TextViewer.h"
#include "app/TreeText.h"
#include "host/HostApplication.h"
#include "host/KeyWatcher.h"
#include "host/SignalWatcher.h"
#include "programs/varnel/HostServices.h"
#include "programs/varnel/PlayedFile.h"
#include "programs/varnel/StandardOutput.h"

namespace varnel {

namespace {

// The displays of a snapshot, a page each, and at most as many as the user wants.
void showAll(const std::vector<Generation>& displays, std::optional<unsigned> most, TextOutput& output) {
  unsigned count = 0;
  for (const Generation& saved : displays) {
    if (most && count++ == *most) return;
    PathDictionary paths;
    const auto tree = VarnelModelNode::makeTreeFromObject_withPathDictionary(saved.display, paths);
    output.show({.status = statusOfSaved(saved.time), .tree = treeAsText(*tree)});
  }
}

}  // namespace

int viewAsText(int& argumentCount, char** arguments, const Options& options,
               const ApplicationInfo& application) {
  HostApplication host(argumentCount, arguments);
  StandardOutput output;
  HostServices services(options, application);
  PlayedFile file(options, services);
  int status = 0;
  output.setEndHandler([&](int error) {
    if (error != 0) {
      status = EXIT_FAILURE;
      std::cerr << programName << ": cannot write to standard output: " << std::strerror(error) << '\n';
    }
    host.end(status);
  });

  if (!file.displays().empty()) {
    showAll(file.displays(), options.updates, output);
    return status;
  }
  std::optional<TextViewer> viewer;
  const auto startOver = [&] {
    file.startOver();
    viewer->startOver();
  };
  const KeyWatcher keys([&](char key) {
    switch (std::toupper(static_cast<unsigned char>(key))) {
      case 'R':
        startOver();
        break;
      case 'S':
        viewer->save();
        break;
      case 'Q':
        host.end(0);
    }
  });
  viewer.emplace(services.model(output.lines()), services.files(), output,
                 keys.isWatching() ? "press R" : "send it SIGUSR1", &services.clock());
  if (options.updates) viewer->afterUpdates(*options.updates, [&] { host.end(status); });
  const SignalWatcher watcher({SIGINT, SIGTERM, SIGHUP, SIGUSR1, SIGUSR2, SIGWINCH}, [&](int signal) {
    switch (signal) {
      case SIGUSR1:
        startOver();
        break;
      case SIGUSR2:
        viewer->save();
        break;
      case SIGWINCH:
        output.showAgain();
        break;
      default:
        host.end(0);
    }
  });
  return host.run();
}

}  // namespace varnel
