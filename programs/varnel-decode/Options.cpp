#include "programs/varnel-decode/Options.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <filesystem>
#include <limits>
#include <span>
#include <system_error>
#include <utility>

#include "LogGenerator/KLV/Subscriber/SimFiles.h"
#include "LogGenerator/Radios/Modem/ReportReader.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-decode/FileOutput.h"
#include "programs/varnel-decode/ProgramError.h"

namespace varnel {

namespace {

constexpr int usageError = 2;
constexpr const char* listOption = "--files-from";
constexpr const char* writtenListOption = "--write-list";
constexpr const char* capturesOption = "CAPTURE";
constexpr const char* mergeOption = "--merge";
constexpr const char* databaseOption = "--sqlite";
constexpr const char* explainOption = "--explain";
constexpr unsigned mostJobs = 256;
constexpr std::string_view eventTableFormat = "csv";  // of events alone, as values have --csv

constexpr const char* examples =
    "PATH names a value as --format paths shows it: 'Serving Cell Measurements/Average RSRP'. --csv and "
    "--plot take all\n"
    "arguments that follow them, except the last one; write several captures before them, or after --. "
    "Instead of the\n"
    "number of a list's record, a value can select the record: 'Neighbor Cells List[Physical Cell "
    "ID=16]/Measured RSRP'\n"
    "is that of the first neighbor with this value. The display templates come from the folder that the "
    "environment\n"
    "variable VARNEL_RESOURCES names, else from the installed one.\n"
    "\n"
    "Captures, snapshots, and all that is written of their messages hold identities of a person, even where "
    "the display\n"
    "hides them: M-TMSI, 5G-TMSI, EF-ICCID, EF-MSISDN, EF-LOCI, positions, and others. Give them only to "
    "those who may "
    "know them.\n"
    "\n"
    "  varnel-decode drive.bin\n"
    "  varnel-decode --events drive.bin\n"
    "  varnel-decode --every drive.bin\n"
    "  varnel-decode --technology kalvi-lte walk.pcap\n"
    "  varnel-decode --technology kalvi-lte walk.pcap --csv 'Serving Cell Measurements/Average RSRP'\n"
    "  varnel-decode --technology kalvi-lte --stats --format json walk.pcap\n"
    "  varnel-decode --technology kalvi-lte --jobs 4 --format json monday.pcap tuesday.pcap\n"
    "  ssh device cat PORT | varnel-decode --every --numbers --changes -\n"
    "  varnel-decode --files-from captures.txt --output decoded --every --jobs 4 --report report.jsonl "
    "--resume\n"
    "  varnel-decode --files-from captures.txt --part 2/8 --sqlite part2.db\n"
    "  varnel-decode --sqlite all.db --merge part1.db part2.db\n"
    "  varnel-decode --explain LTE/Measurements/RSRP\n"
    "  varnel-decode --format none --pcap walk.pcap walk.bin\n"
    "  varnel-decode --format none --messages walk-messages.pcapng walk.bin\n"
    "  varnel-decode --format none --gpx walk.gpx walk.pcapng\n"
    "  varnel-decode --dlf walk.dlf --format none VarnelSnapshot-1709301914.varnel\n";

// The command line as it was typed, before the program checks whether it makes sense.
struct Wishes {
  std::string format;
  bool isEvery = false;
  bool isFollowing = false;
  std::optional<unsigned> subscription;
  bool isNumbers = false;
  bool isChanges = false;
  bool isStatistics = false;
  bool isEvents = false;
  bool isShowingIdentities = false;
  std::vector<std::string> plot;
  std::string messagesAs;
  std::optional<std::string> part;
};

// The values of --messages-as.
constexpr const char* upperPduName = "upper-pdu";
constexpr const char* gsmtapName = "gsmtap";

std::vector<std::string> formatNames() {
  std::vector<std::string> names;
  for (const DisplayFormat& format : displayFormats) names.emplace_back(format.name);
  names.emplace_back(eventTableFormat);
  return names;
}

// The values that tell who the user of a phone is. Where they are shown they may look like numbers.
bool isIdentityPath(std::string_view path) {
  const auto endsIn = [&](std::string_view name) {
    if (!path.ends_with(name)) return false;
    return path.size() == name.size() || path[path.size() - name.size() - 1] == '/';
  };
  return endsIn("M-TMSI") || endsIn("5G-TMSI") || endsIn(modem::latitudeEntry) ||
         endsIn(modem::longitudeEntry) || endsIn(modem::altitudeEntry) ||
         std::ranges::any_of(simFiles,
                             [&](const SimFile& file) { return file.namesPerson && endsIn(file.entry); });
}

DisplayWriter writerNamed(std::string_view name) {
  const auto* const found = std::ranges::find(displayFormats, name, &DisplayFormat::name);
  return found == std::end(displayFormats) ? displayAsText : found->write;
}

EventFormat eventFormatNamed(std::string_view name) {
  if (name == eventTableFormat) return EventFormat::Csv;
  return name == "json" ? EventFormat::Json : EventFormat::Text;
}

enum class CaptureIs { Required, NamedElsewhere };

// The help does not call captures required, as some options name them.
CaptureIs captureIsIn(std::span<const char* const> arguments) {
  const bool isElsewhere = std::ranges::any_of(arguments, [](std::string_view argument) {
    const std::string_view name = argument.substr(0, argument.find('='));
    return name == listOption || name == mergeOption || name == explainOption || name == "--help" ||
           name == "-h";
  });
  return isElsewhere ? CaptureIs::NamedElsewhere : CaptureIs::Required;
}

void declareInput(CLI::App& app, Options& options, Wishes& wishes,
                  const std::vector<std::string>& technologies, CaptureIs captureIs) {
  app.add_option("--technology", options.technology,
                 "the modem that was captured; unless given, the one that the capture names, else all-radios")
      ->check(CLI::IsMember(technologies));
  app.add_option("--jobs", options.jobs, "decode up to this many captures at the same time")
      ->check(CLI::Range(1U, mostJobs).description(""))
      ->type_name("N")
      ->capture_default_str();
  app.add_option("--log-level", options.logLevel,
                 "write log lines of this priority number and lower; -1 for none")
      ->check(CLI::Range(-1, std::numeric_limits<int>::max()).description(""))
      ->type_name("N")
      ->capture_default_str();
  app.add_option(
         "--sim", wishes.subscription,
         "take the records of this SIM card, and those that name no card; modems count from 1. Without "
         "it all-radios shows all cards side by side, and others show the first")
      ->check(CLI::Range(1U, 255U).description(""))
      ->type_name("N");
  app.add_flag("--follow", wishes.isFollowing, "wait for more at the end of the file, until interrupted");
  auto* captures = app.add_option(
      capturesOption, options.captures,
      "a stream of a diagnostic port, log records, pcap of link type USER0, or a snapshot; - is "
      "standard input; needed unless --files-from, --merge or --explain is given");
  captures->type_name("");
  // An option that takes many arguments leaves the last one to a capture only if there must be one.
  captures->required(captureIs == CaptureIs::Required);
  app.add_option(listOption, options.listPath,
                 "decode the captures that this list names, separated by newlines or NUL characters; - is "
                 "standard input")
      ->type_name("LIST");
  app.add_option("--part", wishes.part,
                 "decode only this part of the captures; all parts have about the same size")
      ->type_name("K/N");
  app.add_option(writtenListOption, options.writtenList,
                 "write the captures with their sizes as a list, and do nothing else; where --part takes "
                 "this list, parts stay the same when captures change")
      ->type_name("FILE");
  app.add_flag("--resume", options.isResuming,
               "leave each capture whose output is there and newer than the capture; with --sqlite, each "
               "that the database has and that has not changed");
  app.add_option(
         mergeOption, options.mergedParts,
         "add up reports of --stats --format json, or databases into that of --sqlite, and do nothing "
         "else")
      ->type_name("PART");
  app.add_option(explainOption, options.explainedPaths,
                 "tell what the values or sections under these paths mean, and do nothing else")
      ->type_name("PATH");
}

void declareOutput(CLI::App& app, Options& options, Wishes& wishes) {
  app.add_option("--output", options.outputFolder,
                 "write a file per capture into this folder, which gets the tree of their names, instead of "
                 "standard output")
      ->type_name("DIR");
  app.add_option(
         databaseOption, options.databasePath,
         "also add the captures to this database: what became of them, their counts, cells and values; "
         "standard output gets only what another option asks for")
      ->type_name("FILE");
  app.add_option("--report", options.reportPath, "also write what became of each capture, as a line of JSON")
      ->type_name("FILE");
  app.add_option("--format", wishes.format, "the form of the display; text unless given")
      ->check(CLI::IsMember(formatNames()));
  auto* every = app.add_flag("--every", wishes.isEvery,
                             "write each display, one every 2 s of the capture, as a line of JSON");
  auto* table = app.add_option("--csv", options.tablePaths,
                               "write the values under these paths as CSV, one row per display; the path "
                               "Elapsed gives the seconds since the first record")
                    ->type_name("PATH")
                    ->excludes(every);
  auto* statistics =
      app.add_flag("--stats", wishes.isStatistics,
                   "count the messages of each log code: received, decoded, too short, too long, unknown, of "
                   "an unknown version")
          ->excludes(every)
          ->excludes(table);
  app.add_flag("--events", wishes.isEvents,
               "write what happened to the phone, a line per event: cell changes, handovers, registration, "
               "service, RRC connections, unknown versions; also as --format json or csv")
      ->excludes(every)
      ->excludes(table)
      ->excludes(statistics);
  app.add_flag("--numbers", wishes.isNumbers,
               "with --every and --csv: write plain numbers, and their units separately");
  app.add_flag("--changes", wishes.isChanges,
               "with --every and --csv: write only displays that differ from the one before; in JSON only "
               "what differs");
  app.add_option("--plot", wishes.plot, "also draw the numbers under these paths over time, as SVG")
      ->type_name("FILE PATH")
      ->expected(2, CLI::detail::expected_max_vector_size);
  app.add_flag(
      "--identities", wishes.isShowingIdentities,
      "let all-radios show identities (M-TMSI, 5G-TMSI, EF-ICCID, EF-MSISDN, EF-LOCI, EF-GPRS/PS-LOCI) and "
      "positions, not only that they are present; --stats and --plot never do");
  app.add_option("--snapshot", options.snapshotPath, "also write a snapshot file")->type_name("FILE");
  app.add_option("--dlf", options.binaryLogPath, "also write the binary log of the last displays")
      ->type_name("FILE");
  app.add_option("--records", options.recordsPath, "also write the records of log type 1 end to end")
      ->type_name("FILE");
  app.add_option("--pcap", options.pcapPath, "also write the records as pcap of link type USER0")
      ->type_name("FILE");
  app.add_option("--framed", options.framedPath,
                 "also write the records of log type 1 as a diagnostic port sends them")
      ->type_name("FILE");
  app.add_option("--messages", options.messagesPath,
                 "also write the RRC and NAS messages as pcapng for a packet analyzer")
      ->type_name("FILE");
  app.add_option("--messages-as", wishes.messagesAs,
                 "with --messages: the form of the packets; upper-pdu unless given")
      ->check(CLI::IsMember({upperPduName, gsmtapName}));
  app.add_option(
         "--gpx", options.gpxPath,
         "also write where the modem was as a GPX track, with the levels of all-radios at each point; "
         "for recordings with positions")
      ->type_name("FILE");
}

// The options that name an output file, with the names.
std::vector<std::pair<std::string, std::string>> namedOutputs(const Options& options, const Wishes& wishes) {
  std::vector<std::pair<std::string, std::string>> outputs;
  const auto add = [&](const char* option, const std::optional<std::string>& path) {
    if (path) outputs.emplace_back(option, *path);
  };
  add("--snapshot", options.snapshotPath);
  add("--dlf", options.binaryLogPath);
  add("--records", options.recordsPath);
  add("--pcap", options.pcapPath);
  add("--framed", options.framedPath);
  add("--messages", options.messagesPath);
  add("--gpx", options.gpxPath);
  if (!wishes.plot.empty()) add("--plot", wishes.plot.front());
  return outputs;
}

std::optional<std::string> conflictOfEvents(const Options& options, const Wishes& wishes) {
  const std::string& format = wishes.format;
  if (!wishes.isEvents && format == eventTableFormat)
    return "--format csv goes with --events; --csv writes values";
  if (!wishes.isEvents) return std::nullopt;
  if (!format.empty() && format != "text" && format != "json" && format != eventTableFormat)
    return "--events writes --format text, json or csv only";
  if (options.technology && *options.technology != technology::allRadios)
    return "--events are those of all-radios; leave out --technology";
  return std::nullopt;
}

std::optional<std::string> conflictOfTrack(const Options& options) {
  if (options.gpxPath && options.technology && *options.technology != technology::allRadios)
    return "--gpx writes the levels of all-radios; leave out --technology";
  return std::nullopt;
}

// What is wrong with the options for many captures.
std::optional<std::string> conflictOfMany(const Options& options, const Wishes& wishes) {
  if (options.listPath && !options.captures.empty())
    return "--files-from names all captures; put " + options.captures.front() + " into the list";
  if (wishes.part && !partNamed(*wishes.part))
    return "--part takes a number and how many parts there are, such as 2/8, not " +
           (wishes.part->empty() ? "nothing" : *wishes.part);
  const std::pair<const char*, const std::optional<std::string>*> files[] = {
      {"--files-from", &options.listPath},
      {"--output", &options.outputFolder},
      {"--report", &options.reportPath},
      {databaseOption, &options.databasePath}};
  for (const auto& [option, path] : files)
    if (*path && (*path)->empty()) return std::string(option) + ": the name of the file is empty";
  if (options.outputFolder && wishes.format == "none")
    return "--output has nothing to write with --format none";
  if (options.isResuming && !options.outputFolder && !options.databasePath)
    return "--resume goes with --output or --sqlite";
  return std::nullopt;
}

// What is wrong with the combination of valid options; nothing when they go together.
std::optional<std::string> conflict(const Options& options, const Wishes& wishes) {
  const std::string& format = wishes.format;
  if (wishes.isEvery && !format.empty() && format != "json") return "--every writes --format json only";
  if (!options.tablePaths.empty() && !format.empty())
    return "--csv is a format of its own; leave out --format";
  if (const bool isStream = wishes.isEvery || !options.tablePaths.empty(); !isStream) {
    if (wishes.isNumbers) return "--numbers goes with --every or --csv";
    if (wishes.isChanges) return "--changes goes with --every or --csv";
  }
  if (const auto found = conflictOfEvents(options, wishes)) return found;
  if (const auto found = conflictOfTrack(options)) return found;
  if (wishes.isStatistics && !format.empty() && format != "text" && format != "json")
    return "--stats writes --format text or json only";
  if (const auto identity = std::ranges::find_if(wishes.plot, isIdentityPath); identity != wishes.plot.end())
    return "--plot never draws identities, and " + *identity + " is one";
  if (!wishes.messagesAs.empty() && !options.messagesPath) return "--messages-as goes with --messages";
  if (std::ranges::any_of(options.captures, &std::string::empty)) return "the name of a capture is empty";
  if (const auto found = conflictOfMany(options, wishes)) return found;
  const auto outputs = namedOutputs(options, wishes);
  for (const auto& [option, path] : outputs)
    if (path.empty()) return option + ": the name of the file is empty";
  if (wishes.isFollowing && !wishes.isEvery && !wishes.isEvents && options.tablePaths.empty())
    return "--follow needs --every, --csv or --events, for all else is written at the end";
  if (wishes.isFollowing && !outputs.empty())
    return "--follow has no end, at which " + outputs.front().first + " is written; leave one of them out";
  if (wishes.isFollowing && (options.outputFolder || options.reportPath || options.databasePath))
    return "--follow has no end, at which --output, --report and --sqlite are written; leave them out";
  if (options.captures.size() < 2 && !options.listPath) return std::nullopt;
  if (wishes.isFollowing) return "--follow takes one capture at a time";
  if (format == "plist" && !options.outputFolder) return "--format plist takes one capture at a time";
  if (!outputs.empty())
    return outputs.front().first + " takes one capture at a time, for each would overwrite the one before";
  if (std::ranges::count(options.captures, "-") > 1) return "standard input can be read only once";
  return std::nullopt;
}

// An existing file among the paths of an option that takes all arguments but the last. A path that is also
// the name of a file can be written with a slash before it.
std::optional<std::string> fileTakenForPath(std::string_view option, std::span<const std::string> paths) {
  const auto isFile = [](const std::string& path) {
    std::error_code failure;
    const auto status = std::filesystem::status(path, failure);
    return std::filesystem::exists(status) && !std::filesystem::is_directory(status);
  };
  const auto found = std::ranges::find_if(paths, isFile);
  if (found == paths.end()) return std::nullopt;
  return std::string(option) + " took " + *found + " for a path; put -- before it";
}

std::optional<std::string> fileTakenForPath(const Options& options, const Wishes& wishes) {
  if (auto taken = fileTakenForPath("--csv", options.tablePaths)) return taken;
  const std::span plot(wishes.plot);
  return fileTakenForPath("--plot", plot.subspan(std::min<std::size_t>(1, plot.size())));
}

Output outputFor(const Options& options, const Wishes& wishes) {
  if (wishes.isEvery) return Output::EveryDisplay;
  if (!options.tablePaths.empty()) return Output::ValueTable;
  if (wishes.isEvents) return Output::Events;
  if (!wishes.isStatistics) return Output::Display;
  return wishes.format == "json" ? Output::StatisticsJson : Output::StatisticsTable;
}

// An option that was given beside these.
std::optional<std::string> optionBeside(const CLI::App& app, std::initializer_list<const char*> names) {
  for (const CLI::Option* option : app.get_options())
    if (option->count() > 0 &&
        std::ranges::none_of(names, [&](const char* name) { return option->check_name(name); }))
      return option->get_name();
  return std::nullopt;
}

void fulfill(Options& options, const Wishes& wishes) {
  const bool isForDatabaseAlone = options.databasePath && !options.outputFolder;
  const std::string format = !wishes.format.empty() ? wishes.format : isForDatabaseAlone ? "none" : "text";
  options.output = outputFor(options, wishes);
  if (wishes.subscription) options.subscription = static_cast<std::uint8_t>(*wishes.subscription);
  if (wishes.isFollowing) options.atEnd = AtEndOfFile::WaitForMore;
  if (wishes.isShowingIdentities) options.identities = Identities::Shown;
  if (wishes.isNumbers) options.style.valuesAs = ValuesAs::Numbers;
  if (wishes.isChanges) options.style.displays = Displays::Changed;
  options.writeDisplay = writerNamed(format);
  if (wishes.messagesAs == gsmtapName) options.messagesAs = MessageForm::Gsmtap;
  options.eventFormat = eventFormatNamed(format);
  if (wishes.isEvents || options.gpxPath) options.technology = technology::allRadios;
  const bool isForReading = (options.output == Output::Display && (format == "text" || format == "paths")) ||
                            options.output == Output::StatisticsTable ||
                            (options.output == Output::Events && options.eventFormat == EventFormat::Text);
  if (wishes.part) options.part = partNamed(*wishes.part);
  options.areSeveral = options.captures.size() > 1 || options.listPath;
  options.namesEachCapture = options.sharesOutput() && isForReading;
  if (!wishes.plot.empty())
    options.plot = PlotWish{wishes.plot.front(), {wishes.plot.begin() + 1, wishes.plot.end()}};
}

}  // namespace

ExitStatus mistake(const std::string& text) {
  tell(text + "; see varnel-decode --help");
  return {usageError};
}

std::variant<Options, ExitStatus> readOptions(int argumentCount, const char* const* arguments,
                                              const std::vector<std::string>& technologies,
                                              const std::string& version) {
  Options options;
  Wishes wishes;
  CLI::App app("Decodes captures of the log channel and writes the last display to standard output.",
               programName);
  app.footer(examples);
  app.set_version_flag("--version", programName + (" " + version));
  declareInput(app, options, wishes, technologies, captureIsIn({arguments, arguments + argumentCount}));
  declareOutput(app, options, wishes);
  try {
    app.parse(argumentCount, arguments);
  } catch (const CLI::Success& wish) {  // help or version
    return ExitStatus{app.exit(wish)};
  } catch (const CLI::ParseError& error) {
    return mistake(fileTakenForPath(options, wishes).value_or(error.what()));
  }
  if (!options.explainedPaths.empty()) {
    if (const auto other = optionBeside(app, {explainOption}))
      return mistake(*other + " does not go with --explain, which takes paths only");
    return options;
  }
  if (!options.mergedParts.empty()) {
    if (const auto other = optionBeside(app, {mergeOption, databaseOption}))
      return mistake(*other + " does not go with --merge, which takes only --sqlite");
    return options;
  }
  if (options.writtenList) {
    if (const auto other = optionBeside(app, {writtenListOption, listOption, capturesOption}))
      return mistake(*other + " does not go with --write-list, which takes captures only");
    if (options.writtenList->empty()) return mistake("--write-list: the name of the file is empty");
  }
  if (const auto taken = fileTakenForPath(options, wishes)) return mistake(*taken);
  if (const auto found = conflict(options, wishes)) return mistake(*found);
  fulfill(options, wishes);
  return options;
}

void takeList(Options& options) {
  if (!options.listPath) return;
  CaptureList list = readCaptureList(*options.listPath);
  options.captures = std::move(list.names);
  options.sizes = std::move(list.sizes);
}

// The sizes that a list tells serve for no more than that: a capture may have grown since then.
void takePart(Options& options) {
  if (!options.part) return;
  if (options.sizes.empty()) options.sizes = sizesOf(options.captures);
  options.captures = shareOf(options.captures, options.sizes, *options.part);
  options.sizes = {};
}

void writeList(const Options& options) {
  const std::string list = listWithSizes({options.captures, sizesOf(options.captures)});
  writeFile(*options.writtenList, {reinterpret_cast<const std::uint8_t*>(list.data()), list.size()});
}

}  // namespace varnel
