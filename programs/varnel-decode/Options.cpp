#include "programs/varnel-decode/Options.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <iostream>
#include <limits>

namespace varnel {

namespace {

constexpr int usageError = 2;

std::vector<std::string> formatNames() {
  std::vector<std::string> names;
  for (const DisplayFormat& format : displayFormats) names.emplace_back(format.name);
  return names;
}

DisplayWriter writerNamed(std::string_view name) {
  return std::ranges::find(displayFormats, name, &DisplayFormat::name)->write;
}

}  // namespace

std::variant<Options, ExitStatus> readOptions(int argumentCount, const char* const* arguments,
                                              const std::vector<std::string>& technologies) {
  Options options;
  std::string format = "text";
  CLI::App app("Decodes a capture of the log channel and writes the last display to standard output.",
               "varnel-decode");
  app.add_option("--technology", options.technology, "the modem that was captured")
      ->required()
      ->check(CLI::IsMember(technologies));
  app.add_option("--format", format, "how the display is written")
      ->check(CLI::IsMember(formatNames()))
      ->capture_default_str();
  app.add_option("--log-level", options.logLevel,
                 "write log lines of this priority number and lower; -1 for none")
      ->check(CLI::Range(-1, std::numeric_limits<int>::max()).description(""))
      ->type_name("N")
      ->capture_default_str();
  app.add_option("--snapshot", options.snapshotPath, "also write a snapshot file")->type_name("FILE");
  app.add_option("CAPTURE", options.capturePath, "pcap or pcapng of link type USER0; - is standard input")
      ->required()
      ->type_name("");
  try {
    app.parse(argumentCount, arguments);
  } catch (const CLI::CallForHelp&) {
    std::cout << app.help();
    return ExitStatus{0};
  } catch (const CLI::ParseError& error) {
    std::cerr << "varnel-decode: " << error.what() << "; see varnel-decode --help\n";
    return ExitStatus{usageError};
  }
  options.writeDisplay = writerNamed(format);
  return options;
}

}  // namespace varnel
