#include "programs/varnel-telephonyd/Options.h"

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <iostream>
#include <limits>
#include <utility>
#include <vector>

#include "host/ControlProtocol.h"
#include "host/FileIdentity.h"
#include "host/Printable.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/Fault.h"
#include "programs/varnel-telephonyd/RecordingName.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"

namespace varnel {

namespace {

constexpr const char* programName = "varnel-telephonyd";
constexpr int usageError = 2;

void declare(CLI::App& app, Options& options, const std::string& version) {
  const auto simulated = simulatedTechnologies();
  const std::vector<std::string> technologies(simulated.begin(), simulated.end());

  app.description(
      "Serves the log channel to viewers, from a modem's diagnostic port, from ModemManager, from a "
      "simulated "
      "modem, or from a capture. Without --port, --live, --simulate, and --replay it takes what is there: a "
      "diagnostic port, else ModemManager. SIGINT and SIGTERM end it. A running server can be asked and told "
      "things: see \"varnel-telephonyd ctl --help\".");
  app.set_version_flag("--version", programName + (" " + version));
  auto* port =
      app.add_option("--port", options.portPath,
                     "show what a modem's diagnostic port sends, such as /dev/ttyUSB0; the modem sends "
                     "only what viewers ask for, and nothing any more at the end; auto looks for such a port")
          ->type_name("DEVICE");
  app.add_flag("--inhibit", options.inhibitsModemManager,
               "ask ModemManager to leave the modem alone while the server runs, which cuts the modem's data "
               "connection")
      ->needs(port);
  auto* live =
      app.add_flag("--live", options.isLive,
                   "show what ModemManager tells of a modem: its cells, levels, network, SIM card, and "
                   "connections; for modems without a diagnostic port")
          ->excludes(port);
  app.add_option(
         "--modem", options.modem,
         "this modem, as mmcli -L lists them: its number or its path, or the path of its device; unless "
         "given, any one")
      ->needs(live)
      ->type_name("MODEM");
  app.add_option("--poll", options.poll_s,
                 "ask ModemManager this often for what it does not tell of its own accord, in seconds")
      ->needs(live)
      ->check(CLI::Range(1U, 3600U).description(""))
      ->type_name("SECONDS")
      ->capture_default_str();
  auto* simulate = app.add_option("--simulate", options.simulatedTechnology, "simulate a modem")
                       ->excludes(port)
                       ->excludes(live)
                       ->check(CLI::IsMember(technologies))
                       ->type_name("TECHNOLOGY");
  app.add_option("--seed", options.seed, "the same seed makes the modem send the same messages")
      ->needs(simulate)
      ->type_name("N")
      ->capture_default_str();
  auto* pty = app.add_flag("--pty", options.playsPort,
                           "play the simulated modem's diagnostic port on a pseudo-terminal, whose name is "
                           "printed, and serve nothing: another server shows it with --port")
                  ->needs(simulate);
  auto* replay =
      app.add_option("--replay", options.replayPath,
                     "send the messages of a capture of any kind that varnel-decode reads, with the pauses "
                     "between them; every viewer gets them from the start; - is a pipe, read once, by one "
                     "viewer at a time")
          ->excludes(simulate)
          ->excludes(port)
          ->excludes(live)
          ->type_name("CAPTURE");
  app.add_option("--technology", options.replayTechnology,
                 "the modem that was captured; unless given, the one that the capture names, else all-radios")
      ->needs(replay)
      ->check(CLI::IsMember(technologies))
      ->type_name("TECHNOLOGY");
  app.add_option("--speed", options.speed, "replay this many times as fast")
      ->needs(replay)
      ->type_name("X")
      ->capture_default_str();
  app.add_flag("--loop", options.loops, "start the capture over at its end")->needs(replay);
  app.add_option("--sim", options.subscription,
                 "replay the messages of this SIM card, and those that name no card; unless given, all cards "
                 "for all-radios, else the first card that a message names")
      ->needs(replay)
      ->check(CLI::Range(1U, 255U).description(""))
      ->type_name("N");
  auto* record =
      app.add_option(
             "--record", options.recordPath,
             "write what is sent to viewers to a capture that can be replayed and decoded; its name may "
             "have fields of the time as for date(1), such as %Y%m%d-%H%M%S; refuses a "
             "file that exists and is not empty. It holds identities of a person, such as the "
             "numbers of the SIM card")
          ->excludes(pty)
          ->type_name("CAPTURE");
  app.add_flag_callback(
         "--overwrite", [&options] { options.existingRecording = ExistingRecording::Replaced; },
         "let the recording replace an existing file, when the first message comes")
      ->needs(record);
  app.add_flag(
         "--record-position", options.recordsPosition,
         "also record where the modem is, which the modem or gpsd on this machine tells; without it nobody "
         "is asked")
      ->needs(record)
      ->needs(live);
  app.add_option("--runtime-dir", options.runtimeFolder,
                 "where viewer and server meet; unless given, $XDG_RUNTIME_DIR/varnel, or varnel-UID in the "
                 "temporary "
                 "folder (/tmp) when that variable is not set")
      ->type_name("DIR");
  app.add_option_function<std::string>(
         "--fault",
         [&options](const std::string& text) {
           const auto fault = readFault(text);
           if (!fault) throw CLI::ValidationError("--fault", "must be one of " + namesOfFaults());
           options.fault = *fault;
         },
         "make a fault, for tests of viewers: " + namesOfFaults())
      ->type_name("FAULT");
  app.add_option("--allow-group", options.allowedGroup,
                 "let members of this one group connect too, in a runtime folder that belongs to the group; "
                 "this user "
                 "must be a member; unless given, only this user and root may connect")
      ->type_name("GROUP");
  app.add_option("--log-level", options.logLevel,
                 "also write log lines of this priority number and lower to standard error; -1 for none")
      ->check(CLI::Range(-1, std::numeric_limits<int>::max()))
      ->type_name("N")
      ->capture_default_str();
}

FileIdentity identityOfRecording(const std::string& path) {
  return path == "-" ? FileIdentity::ofDescriptor(STDOUT_FILENO) : FileIdentity::ofPath(path);
}

FileIdentity identityOfCapture(const std::string& path) {
  return path == "-" ? FileIdentity::ofDescriptor(STDIN_FILENO) : FileIdentity::ofPath(path);
}

std::optional<std::string> conflictOfPipe(const Options& options) {
  if (options.replayPath != "-") return std::nullopt;
  if (options.loops) return "--loop needs a file, for standard input can be read only once";
  if (::isatty(STDIN_FILENO)) return "--replay - needs a pipe, and standard input is a terminal";
  return std::nullopt;
}

void nameRecording(Options& options) {
  if (!options.recordPath) return;
  std::string name = recordingNameOfNow(*options.recordPath);
  options.recordPathIsOfNow = name != *options.recordPath;
  options.recordPath = std::move(name);
}

// What is wrong with the combination of valid options; nothing when they go together.
std::optional<std::string> conflict(const Options& options) {
  if (options.playsPort && options.simulatedTechnology == technology::ifxGSM)
    return "the modem of ifx-gsm sends no log packets, so it has no diagnostic port to play";
  if (options.portPath && options.portPath->empty())
    return "--port needs the name of a device, such as /dev/ttyUSB0, or auto";
  if (options.recordPath && options.recordPath->empty()) return "--record needs the name of a file";
  if (!options.replayPath) return std::nullopt;
  if (auto found = conflictOfPipe(options)) return found;
  if (!isPlayable(options.speed)) return "--speed must lie between 0.001 and 1000000";
  if (options.recordPath &&
      identityOfRecording(*options.recordPath).isSameFileAs(identityOfCapture(*options.replayPath)))
    return "--record would overwrite the capture that is to be replayed";
  return std::nullopt;
}

ExitStatus mistake(const std::string& text) {
  std::cerr << programName << ": " << printable(text) << "; see " << programName << " --help\n";
  return {usageError};
}

}  // namespace

std::variant<Options, ExitStatus> readOptions(int argumentCount, const char* const* arguments,
                                              const std::string& version) {
  Options options;
  CLI::App app("", programName);
  declare(app, options, version);
  try {
    app.parse(argumentCount, arguments);
  } catch (const CLI::Success& wish) {  // help or version
    return ExitStatus{app.exit(wish)};
  } catch (const CLI::ParseError& error) {
    return mistake(error.what());
  }
  nameRecording(options);
  if (const auto found = conflict(options)) return mistake(*found);
  return options;
}

}  // namespace varnel
