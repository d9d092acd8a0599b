#include <CLI/CLI.hpp>
#include <csignal>
#include <iostream>
#include <optional>
#include <string>

#include "app/TextViewer.h"
#include "platform/PropertyList.h"
#include "platform/host/BuildInfo.h"
#include "platform/host/EventLoopQueue.h"
#include "platform/host/FileResources.h"
#include "platform/host/HostApplication.h"
#include "platform/host/HostLog.h"
#include "platform/host/RootedFiles.h"
#include "platform/host/RuntimeFolder.h"
#include "platform/host/SignalWatcher.h"
#include "platform/host/SocketPorts.h"
#include "platform/host/SocketTelephonyService.h"
#include "platform/host/SystemClock.h"
#include "platform/host/TerminateHandler.h"
#include "programs/varnel/StandardOutput.h"

namespace varnel {

namespace {

constexpr const char* programName = "varnel";
constexpr int generalError = 1;
constexpr int usageError = 2;

struct Options {
  std::string userInterface = "text";
  std::string deviceRoot = "/";
  std::optional<std::string> runtimeFolder;
  std::optional<int> logLevel;
  std::optional<unsigned> updates;
};

void declare(CLI::App& app, Options& options, const ApplicationInfo& application) {
  app.description("Shows what the cellular modem behind the telephony server sees.");
  app.footer(
      "SIGUSR1 starts over with an empty display. SIGUSR2 saves a snapshot into\n"
      "var/mobile/Library/Logs/CrashReporter under the device root, on devices that allow it.");
  app.set_version_flag("--version", programName + std::string(" ") + application.version.value_or("(none)"));
  app.add_option("--ui", options.userInterface, "how the display is shown: text")
      ->check(CLI::IsMember({"text"}))
      ->capture_default_str();
  app.add_option("--device-root", options.deviceRoot, "put before the device's absolute paths")
      ->type_name("DIR")
      ->capture_default_str();
  app.add_option("--runtime-dir", options.runtimeFolder,
                 "where viewer and server meet; $XDG_RUNTIME_DIR/varnel unless given")
      ->type_name("DIR");
  app.add_option("--log-level", options.logLevel,
                 "also write log lines of this priority number and lower to standard error")
      ->type_name("N");
  app.add_option("--updates", options.updates, "end after that many refreshes")
      ->check(CLI::PositiveNumber)
      ->type_name("N");
}

int view(int& argumentCount, char** arguments, const Options& options, const ApplicationInfo& application) {
  HostApplication host(argumentCount, arguments);
  const HostLog log({.programName = programName, .standardErrorLevel = options.logLevel});
  const std::filesystem::path folder = runtimeFolder(options.runtimeFolder);
  SocketPorts ports(folder);
  SocketTelephonyService telephony(folder);
  EventLoopQueue queue;
  const FileResources resources(resourceFolder());
  const SystemClock clock;
  RootedFiles files(options.deviceRoot);
  StandardOutput output;

  TextViewer viewer(
      {ports, telephony, queue, {resources, clock, application, std::cout}, writeXmlPropertyList}, files,
      output);
  if (options.updates) viewer.afterUpdates(*options.updates, [&host] { host.end(0); });
  const SignalWatcher watcher({SIGINT, SIGTERM, SIGUSR1, SIGUSR2}, [&](int signal) {
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
  return host.run();
}

int run(int argumentCount, char** arguments) {
  const ApplicationInfo application = applicationInfo();
  Options options;
  CLI::App app("", programName);
  declare(app, options, application);
  try {
    app.parse(argumentCount, arguments);
  } catch (const CLI::Success& wish) {  // help or version
    return app.exit(wish);
  } catch (const CLI::ParseError& error) {
    std::cerr << programName << ": " << error.what() << "; see " << programName << " --help\n";
    return usageError;
  }
  try {
    return view(argumentCount, arguments, options, application);
  } catch (const std::runtime_error& error) {
    std::cerr << programName << ": " << error.what() << '\n';
    return generalError;
  }
}

}  // namespace

}  // namespace varnel

int main(int argumentCount, char** arguments) {
  varnel::installTerminateHandler(varnel::programName);
  return varnel::run(argumentCount, arguments);
}
