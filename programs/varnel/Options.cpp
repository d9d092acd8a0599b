#include "programs/varnel/Options.h"

#include <limits>
#include <vector>

#include "LogGenerator/LogGenerator.h"

namespace varnel {

namespace {

// What is wrong with the name; empty when nothing is.
std::string faultOfFile(const std::string& name) {
  if (name.empty()) return "FILE needs the name of a file";
  return name == "-" ? "a pipe is shown by varnel-telephonyd --replay - and a viewer beside it" : "";
}

}  // namespace

void declare(CLI::App& parser, Options& options, const ApplicationInfo& application) {
  parser.description(
      "Shows what a cellular modem sees: that behind the telephony server, or that of a file.");
  parser.footer(
      "SIGUSR1 starts over with an empty display. SIGUSR2 saves a snapshot into\n"
      "var/mobile/Library/Logs/CrashReporter under the device root, if the device allows it.\n"
      "\n"
      "In the window: Ctrl+O to open a file, Ctrl+P to play or pause, Ctrl+W to close it;\n"
      "arrow keys, Return to open, Escape to go back, Shift and Left or Right\n"
      "for long values, T for the trend of a number, Ctrl+F to find a row, Ctrl+C to copy,\n"
      "Ctrl+S to save a snapshot, Ctrl+R to start over, Ctrl+Q to end, F1 for all keys and\n"
      "what the row means.\n"
      "In a terminal: the same, and j, k, h, l, g, G; s to save, R to start over, q to end,\n"
      "/ to find a row, T for the course of a value, L for log lines, ? for all keys.\n"
      "As text: S to save a snapshot, R to start over, Q to end.\n"
      "\n"
      "VARNEL_RESOURCES in the environment names the folder of the display templates and the\n"
      "screen layout, if not the installed one.");
  parser.set_version_flag("--version",
                          programName + std::string(" ") + application.version.value_or("(none)"));
  auto* const file =
      parser
          .add_option(
              "FILE", options.file,
              "a capture of any kind that varnel-decode reads, which is played, or a snapshot; unless "
              "given, the telephony server is shown")
          ->check(faultOfFile)
          ->type_name("");
  const auto technologies = LogGenerator::technologies();
  parser
      .add_option(
          "--technology", options.technology,
          "the modem that was captured; unless given, the one that the capture names, else all-radios")
      ->needs(file)
      ->check(CLI::IsMember(std::vector<std::string>(technologies.begin(), technologies.end())))
      ->type_name("TECHNOLOGY");
  parser
      .add_option(
          "--ui", options.userInterface,
          "how the display is shown: window, terminal, text, or auto (a window if there is a graphical "
          "display, else the terminal if standard input and output are one, else text)")
      ->check(CLI::IsMember({"auto", "window", "terminal", "text"}))
      ->capture_default_str();
  parser
      .add_option("--device-root", options.deviceRoot,
                  "the folder that stands for the root of the device's file system; $XDG_STATE_HOME/varnel "
                  "unless given or / is a device")
      ->type_name("DIR");
  parser
      .add_option("--runtime-dir", options.runtimeFolder,
                  "where viewer and server meet; unless given, $XDG_RUNTIME_DIR/varnel, or varnel-UID in the "
                  "temporary "
                  "folder (/tmp) when that variable is not set, and /run/varnel when no server is there")
      ->excludes(file)
      ->type_name("DIR");
  parser
      .add_option("--log-level", options.logLevel,
                  "also write log lines of this priority number and lower to standard error; -1 for none")
      ->check(CLI::Range(-1, std::numeric_limits<int>::max()).description(""))
      ->type_name("N")
      ->capture_default_str();
  parser
      .add_option(
          "--sim", options.subscription,
          "show the messages of this SIM card, and those that name no card; cards usually count from 1")
      ->check(CLI::Range(1U, 255U).description(""))
      ->type_name("N");
  parser.add_flag(
      "--identities", options.showsIdentities,
      "let all-radios show identities (M-TMSI, 5G-TMSI, EF-ICCID, EF-MSISDN, EF-LOCI, "
      "EF-GPRS/PS-LOCI) and positions, not only that they are present; snapshots hold them in any "
      "case");
  parser.add_option("--updates", options.updates, "end after this many refreshes")
      ->check(CLI::Range(1U, std::numeric_limits<unsigned>::max()).description(""))
      ->type_name("N");
}

}  // namespace varnel
