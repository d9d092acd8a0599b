#include "programs/varnel-telephonyd/ControlProgram.h"

#include <CLI/CLI.hpp>
#include <iostream>
#include <optional>
#include <string_view>

#include "host/HostApplication.h"
#include "host/Printable.h"
#include "host/RuntimeFolder.h"
#include "host/ServerControl.h"
#include "programs/varnel-telephonyd/StatusText.h"

namespace varnel {

namespace {

using Command = ControlRequest::Command;

constexpr const char* programName = "varnel-telephonyd ctl";
constexpr int usageError = 2, generalError = 1;

struct ControlOptions {
  ControlRequest request;
  std::optional<std::string> runtimeFolder;
  bool wantsJson = false;
};

// A command line can hold bytes that no request can.
bool isSendable(const std::string& technology) {
  const Bytes request =
      controlProtocol::writeRequest({.command = Command::SetTechnology, .technology = technology});
  return !request.empty() && request.size() <= controlProtocol::longestRequest;
}

void declare(CLI::App& app, ControlOptions& options, const std::string& version) {
  app.description("Controls the telephony server that runs in a runtime folder.");
  app.set_version_flag("--version", "varnel-telephonyd " + version);
  app.require_subcommand(1);
  app.add_option(
         "--runtime-dir", options.runtimeFolder,
         "the folder of the server; unless given, $XDG_RUNTIME_DIR/varnel, or varnel-UID in the temporary "
         "folder (/tmp) when that variable is not set, and /run/varnel when no server is there")
      ->type_name("DIR");
  const auto command = [&](const char* name, Command meaning, const char* explanation) {
    CLI::App* const added = app.add_subcommand(name, explanation);
    added->fallthrough();
    added->callback([&options, meaning] { options.request.command = meaning; });
    return added;
  };
  command("status", Command::Status, "tell what the server does")
      ->add_flag("--json", options.wantsJson, "as a JSON object");
  command("pause", Command::Pause, "stop the stream where it is");
  command("continue", Command::Continue, "let the stream go on");
  command("speed", Command::SetSpeed, "play this many times as fast")
      ->add_option("X", options.request.speed, "from 0.001 to 1000000")
      ->required();
  command("seek", Command::Seek, "go to a place: everything before it is sent at once")
      ->add_option_function<std::string>(
          "TIME",
          [&options](const std::string& text) {
            const auto place = readPlace(text);
            if (!place)
              throw CLI::ValidationError("TIME", "must be like 90, 1:30, or \"2026-11-22 14:00:05\" in UTC");
            options.request.place = *place;
          },
          "after the start, such as 90, 1:30, or 0:01:30.5; or by the capture's clock, such as \"2026-11-22 "
          "14:00:05\" in UTC")
      ->required();
  command("technology", Command::SetTechnology, "serve as that of another modem; viewers come back with it")
      ->add_option("NAME", options.request.technology, "as for --technology")
      ->check(
          [](const std::string& name) { return isSendable(name) ? "" : "must be the name of a technology"; })
      ->required();
  command("stop", Command::Stop, "end the server");
}

int fail(std::string_view text, int status) {
  std::cerr << programName << ": " << printable(std::string(text)) << '\n';
  return status;
}

int ask(const ControlOptions& options) {
  RuntimeFolder folder = controllersFolder(options.runtimeFolder);
  if (!options.runtimeFolder) folder = nearestControl(std::move(folder), systemsFolder);
  ServerControl server(std::move(folder));
  const ServerStatus status = server.ask(options.request);
  if (options.request.command != Command::Status) return 0;
  std::cout << (options.wantsJson ? statusJson(status) + '\n' : statusText(status)) << std::flush;
  return std::cout ? 0 : generalError;
}

}  // namespace

bool isControlCommand(int argumentCount, const char* const* arguments) {
  return argumentCount > 1 && arguments[1] == std::string_view("ctl");
}

int runControlCommand(int argumentCount, char** arguments, const std::string& version) {
  ControlOptions options;
  CLI::App app("", programName);
  declare(app, options, version);
  try {
    app.parse(argumentCount - 1, arguments + 1);
  } catch (const CLI::Success& wish) {  // help or version
    return app.exit(wish);
  } catch (const CLI::ParseError& error) {
    return fail(std::string(error.what()) + "; see " + programName + " --help", usageError);
  }
  const HostApplication application(argumentCount, arguments);
  try {
    return ask(options);
  } catch (const std::runtime_error& error) {
    return fail(error.what(), generalError);
  }
}

}  // namespace varnel
