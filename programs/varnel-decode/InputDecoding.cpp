#include "programs/varnel-decode/InputDecoding.h"

#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <set>
#include <stdexcept>
#include <system_error>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "app/Snapshot.h"
#include "base/FitForXml.h"
#include "base/PropertyList.h"
#include "host/FileResources.h"
#include "host/HostLog.h"
#include "host/Printable.h"
#include "host/captures/Capture.h"
#include "model/events/DisplayEvents.h"
#include "platform/TelephonyService.h"
#include "programs/shared/OfflineDecoder.h"
#include "programs/shared/SnapshotFile.h"
#include "programs/shared/Timestamps.h"
#include "programs/varnel-decode/ElapsedTime.h"
#include "programs/varnel-decode/EventWriter.h"
#include "programs/varnel-decode/FileOutput.h"
#include "programs/varnel-decode/GenerationWriters.h"
#include "programs/varnel-decode/GpxTrack.h"
#include "programs/varnel-decode/MessageStatistics.h"
#include "programs/varnel-decode/Picture.h"
#include "programs/varnel-decode/ProgramError.h"
#include "programs/varnel-decode/ProgressBar.h"
#include "programs/varnel-decode/RadioSummary.h"
#include "programs/varnel-decode/RecordOutputs.h"
#include "programs/varnel-decode/StandardOutput.h"
#include "programs/varnel-decode/Subscriptions.h"
#include "programs/varnel-decode/TechnologyFormats.h"
#include "programs/varnel-decode/TechnologyGuess.h"

namespace varnel {

namespace {

constexpr int generalError = 1;
constexpr std::uint64_t recordsBetweenNotes = 256;

// The user's technology comes before that of the capture.
std::string technologyOf(const Capture& capture, const Options& options,
                         const std::vector<std::string>& technologies) {
  if (options.technology) return *options.technology;
  const auto named = capture.technology();
  const bool isKnown = named && std::ranges::find(technologies, *named) != technologies.end();
  return isKnown ? *named : std::string(technology::allRadios);
}

// Absent also for an input that can be read only once, and for anything that is no capture. Decoding reports
// why.
std::optional<std::string> technologyIn(const std::string& path, const Options& options,
                                        const std::vector<std::string>& technologies) {
  std::error_code failure;
  if (options.technology || !std::filesystem::is_regular_file(path, failure)) return options.technology;
  try {
    return technologyOf(*openCapture(path), options, technologies);
  } catch (const CaptureError&) {
    return std::nullopt;
  }
}

// The technologies that the displays may belong to: all, when it is not known, as with a snapshot.
std::vector<std::string> possibleTechnologies(const std::optional<std::string>& technology,
                                              const DecodingServices& services) {
  return technology ? std::vector{*technology} : services.technologies;
}

// For a sink that outlives the decoding.
class ForwardingSink final : public GenerationSink {
 public:
  explicit ForwardingSink(GenerationSink& sink) : _sink(sink) {}
  void take(const Generation& generation) override { _sink.take(generation); }
  void finish(const std::string& inputName) override { _sink.finish(inputName); }

 private:
  GenerationSink& _sink;
};

// Does everything that the options ask for with one capture or snapshot.
class InputDecoding {
 public:
  InputDecoding(const Options& options, std::size_t index, DecodingNotes* notes)
      : _options(options),
        _notes(notes),
        _path(options.captures[index]),
        _name(captureName(_path)),
        _isFirst(index == 0),
        _captureName(options.sharesOutput() ? std::optional(_path) : std::nullopt),
        _subscriptions(options.subscription),
        _outputs(options),
        _eventWriter(stdout, _captureName, options.eventFormat) {}

  int run(const DecodingServices& services) {
    const int status = decode(services);
    if (isCountedForOthers()) *_notes->statistics = std::move(_statistics);
    if (_notes) _notes->isOutputBroken = _isOutputBroken;
    return status;
  }

 private:
  struct Sink {
    std::unique_ptr<GenerationSink> sink;
    bool hasFailed = false;
  };

  int decode(const DecodingServices& services) {
    std::optional<ByteWindow> bytes;
    bool isSnapshot = false;
    const bool isOpen = succeeds([&] {
      bytes.emplace(openFile(_path, _options.atEnd));
      isSnapshot = SnapshotFile::isPropertyList(*bytes);
    });
    if (!isOpen) return generalError;
    if (isSnapshot) return showSnapshot(*bytes, services);
    std::unique_ptr<Capture> capture;
    if (!succeeds([&] { capture = openCapture({std::move(*bytes), _name, tell}); })) return generalError;
    return decodeCapture(*capture, services);
  }

  void addSinks(const std::optional<std::string>& technology, const DecodingServices& services) {
    if (_options.style.valuesAs == ValuesAs::Numbers || isGatheringChanges())
      _formats = numberFormatsOf(possibleTechnologies(technology, services), services.services);
    const auto add = [this](auto sink) { _sinks.push_back({std::move(sink)}); };
    std::vector<std::string> paths = _options.tablePaths;
    if (_options.plot) paths.insert(paths.end(), _options.plot->paths.begin(), _options.plot->paths.end());
    if (!paths.empty()) add(std::make_unique<SeenPaths>(paths, _guess));
    if (_options.output == Output::EveryDisplay)
      add(std::make_unique<EveryDisplay>(stdout, _captureName, _options.style, _formats));
    if (_options.output == Output::ValueTable) {
      add(std::make_unique<ValueTable>(stdout, _options.tablePaths, _captureName, _options.style, _formats));
      // Several captures share one table, whose header is already written.
      if (!_captureName) {
        feed(_sinks.back(), [this] {
          writeOutput(stdout, csvHeader(_options.tablePaths, TableColumns::TimeAndValues, _formats));
        });
      }
    }
    if (_options.plot) add(std::make_unique<Picture>(*_options.plot));
    if (isGatheringChanges()) {
      _notes->changes->setFormats(_formats);
      add(std::make_unique<ForwardingSink>(*_notes->changes));
    }
  }

  bool isGatheringChanges() const { return _notes && _notes->changes; }

  // A sink that has failed gets nothing more; the others go on.
  void feed(Sink& sink, const std::function<void()>& part) {
    if (sink.hasFailed) return;
    sink.hasFailed = !succeeds(part);
    _isOutputBroken |= sink.hasFailed;
  }

  int decodeCapture(Capture& capture, const DecodingServices& services) {
    if (isConvertingAlone()) return convert(capture);
    const std::string technology = technologyOf(capture, _options, services.technologies);
    _subscriptions = Subscriptions(_options.subscription, unaskedOf(technology));
    addSinks(technology, services);
    const int status = decodeCaptureOf(technology, capture, services);
    tellGuess(technology, services);
    return status;
  }

  int decodeCaptureOf(const std::string& technology, Capture& capture, const DecodingServices& services) {
    _outputs.open();
    HostLog log({.standardErrorLevel = _options.logLevel, .systemLog = HostLog::SystemLog::Unused});
    const auto generator = LogGenerator::generatorFromTechnology(technology, services.services);
    OfflineDecoder decoder(*generator, services.clock, isSaving() ? RawBytes::Kept : RawBytes::NotKept);

    if (_options.gpxPath) _track.emplace(*_options.gpxPath, *generator);
    _isOutputBroken |= !succeeds([&] { beginEvents(); });
    bool isDone = succeeds([&] { read(capture, *generator, decoder, log, services.templates); });
    if (services.templates.missing()) return failWithout(*services.templates.missing());
    _statistics.setCapture(_subscriptions.counts(), capture.leftOut());
    isDone &= finishOutputs();
    if (isDone && !isPointless()) isDone = succeeds([&] { requireRecords(decoder); });
    tellClockSteps(decoder.clockSteps());
    const Value display = decoder.finish();
    const Time end = services.clock.now();
    if (decoder.hasStarted()) report({end, display});
    if (isSaving()) {
      const Value items = decoder.saveContents();
      tellLeftOut(generator->messagesLeftOutOfLog());
      if (_options.snapshotPath) isDone &= succeeds([&] { writeSnapshotFile(end, items); });
      isDone &= writeBinaryLog(items);
    }
    isDone &= finishSinks();
    if (_track && decoder.hasStarted()) isDone &= succeeds([&] { _track->finish(_name); });
    isDone &= !_hasTrackFailed;
    isDone &= succeeds([&] { writeSummary(display); });
    return isDone && !_isOutputBroken ? 0 : generalError;
  }

  static int failWithout(const std::string& displayTemplate) {
    tell("the display template " + (resourceFolder() / (displayTemplate + ".plist")).string() +
         " is missing or damaged, so nothing can be shown; install it, or name the folder that has it by "
         "VARNEL_RESOURCES");
    return generalError;
  }

  // Throws when there are no records. Otherwise tells users about those that were not decoded.
  void requireRecords(const OfflineDecoder& decoder) const {
    const auto remark = _subscriptions.remark(_name);
    if (!decoder.hasStarted())
      throw std::runtime_error(remark.value_or(_name + " has no records, so there is nothing to show"));
    if (remark) tell(*remark);
  }

  // Whether no output shows what the records say.
  bool isConvertingAlone() const {
    return !_outputs.areNone() && _options.output == Output::Display &&
           _options.writeDisplay == displayAsNothing && !_options.plot && !_options.gpxPath && !isSaving();
  }

  int convert(Capture& capture) {
    _outputs.open();
    CaptureRecord record;
    bool isDone = succeeds([&] {
      while (capture.next(record)) pass(record);
      if (_subscriptions.counts().empty())
        throw std::runtime_error(_name + " has no records, so there is nothing to write");
    });
    isDone &= finishOutputs();
    return isDone ? 0 : generalError;
  }

  // Without records, earlier files stay.
  bool finishOutputs() { return _subscriptions.counts().empty() || _outputs.finish(_name); }

  // Counts the record and writes it to the outputs. Returns whether it is to be decoded.
  bool pass(const CaptureRecord& record) {
    const bool isChosen = _subscriptions.take(record);
    // Without a choice of the user, all records are kept: nothing is mixed up in these outputs.
    if (isChosen || !_options.subscription) _outputs.write(record);
    return isChosen;
  }

  void read(Capture& capture, const LogGenerator& generator, OfflineDecoder& decoder, HostLog& log,
            const TemplateWatch& templates) {
    const bool isStreaming = _options.output == Output::EveryDisplay ||
                             _options.output == Output::ValueTable || _options.output == Output::Events;
    ProgressBar progress(
        capture,
        isStreaming ? ProgressBar::Output::GoesToTerminalAlongside : ProgressBar::Output::LeavesTerminalAlone,
        log, _options.logLevel);
    const bool isCounting = countsMessages();
    std::uint64_t recordsRead = 0;
    CaptureRecord record;
    while (!isPointless() && !templates.missing() && capture.next(record)) {
      progress.recordRead();
      if (_notes && _notes->bytesRead && recordsRead++ % recordsBetweenNotes == 0)
        *_notes->bytesRead = capture.bytesRead();
      if (!pass(record)) continue;
      if (isCounting || !_guess.isAnyKnown()) count(record.message, generator.fateOf(record.message));
      if (const auto generation = decoder.fireTicks(record.time)) report(*generation);
      _elapsed.record(record.time);
      _dating = record.dating;
      decoder.deliver(record.time, record.message);
      if (_options.output == Output::Events) writeEvents(decoder);
      if (_track) takePosition(record, decoder);
    }
  }

  // A track that fails is reported and gets nothing more.
  void takePosition(const CaptureRecord& record, const OfflineDecoder& decoder) {
    const auto time = record.dating == Dating::Known ? std::optional(decoder.now()) : std::nullopt;
    if (succeeds([&] { _track->take(record.message, time, decoder.now(), decoder.display()); })) return;
    _track.reset();
    _hasTrackFailed = true;
  }

  void beginEvents() {
    if (_options.output != Output::Events) return;
    if (_options.isEventTable() && !_captureName)
      writeOutput(stdout, eventTableHeader(EventColumns::WithoutCapture));
    writeOutput(stdout, heading());
  }

  // Writes what the last record has brought about. Without a reader of the output, nothing more is looked at.
  void writeEvents(const OfflineDecoder& decoder) {
    if (_isOutputBroken) return;
    for (const DisplayEvent& event : _events.lookAt(decoder.display(), decoder.now())) {
      _isOutputBroken |= !succeeds([&] { _eventWriter.write(event, _dating, _elapsed.at(decoder.now())); });
      if (_isOutputBroken) return;
    }
  }

  void count(ByteView message, const MessageFate& fate) {
    if (countsMessages()) _statistics.add(fate);
    if (!_guess.isAnyKnown()) _guess.take(message, fate);
  }

  // The technology is more likely to be wrong than the capture.
  void tellGuess(const std::string& technology, const DecodingServices& services) const {
    if (!_guess.isNeeded() || services.templates.missing()) return;
    tell(_guess.sentence(_name, technology, services.technologies, services.services));
  }

  // The option that only captures can fulfill; nothing when there is none.
  std::optional<std::string> wishForCapture() const {
    if (writesStatistics()) return "--stats counts the messages of captures";
    if (_options.output == Output::Events) return "--events tells what happened in captures";
    if (!_outputs.areNone())
      return "--records, --pcap, --framed and --messages write the records of captures";
    if (_options.gpxPath) return "--gpx writes the positions in captures";
    if (_options.subscription) return "--sim chooses among the records of captures";
    if (_options.snapshotPath) return "--snapshot saves what was decoded of a capture";
    return std::nullopt;
  }

  int showSnapshot(ByteWindow& bytes, const DecodingServices& services) {
    if (const auto wish = wishForCapture()) return mistake(*wish + ", but " + _name + " is a snapshot").code;
    addSinks(_options.technology, services);
    std::optional<SnapshotFile> snapshot;
    if (!succeeds([&] { snapshot.emplace(bytes, _name); })) return generalError;
    bool isDone = _sinks.empty() || succeeds([&] {
                    for (const Generation& generation : snapshot->generations()) {
                      _elapsed.record(generation.time);
                      report(generation);
                    }
                  });
    isDone &= writeBinaryLog(snapshot->items());
    isDone &= finishSinks();
    isDone &= succeeds([&] { writeSummary(snapshot->shown()); });
    return isDone && !_isOutputBroken ? 0 : generalError;
  }

  void report(Generation generation) {
    generation.dating = _dating;
    generation.elapsed = _elapsed.at(generation.time);
    for (Sink& sink : _sinks) feed(sink, [&] { sink.sink->take(generation); });
  }

  bool finishSinks() {
    bool isDone = true;
    if (isPointless()) return isDone;
    for (const Sink& sink : _sinks) isDone &= succeeds([&] { sink.sink->finish(_name); });
    return isDone;
  }

  // Whether nobody would see the rest of the capture.
  bool isPointless() const {
    return _isOutputBroken && !_options.plot && !_options.gpxPath && !isSaving() && _outputs.areNone() &&
           !isGatheringChanges();
  }

  bool isSaving() const { return _options.snapshotPath || _options.binaryLogPath; }

  void writeSnapshotFile(Time time, const Value& items) const {
    const auto list = writeXmlPropertyList(fitForXml(snapshotContents(time, items, "")));
    if (!list)
      throw std::runtime_error("the snapshot is larger than a property list may be, so " +
                               *_options.snapshotPath + " was not written");
    writeFile(*_options.snapshotPath, *list);
  }

  bool writeBinaryLog(const Value& items) const {
    return !_options.binaryLogPath || succeeds([&] {
      const Bytes* log = binaryLogOf(items);
      if (!log)
        throw std::runtime_error(_name + " has no binary log, as modems without packets have none; " +
                                 *_options.binaryLogPath + " was not written");
      writeFile(*_options.binaryLogPath, *log);
    });
  }

  void tellClockSteps(const ClockSteps& steps) const {
    if (steps.count == 0 || isPointless()) return;
    const std::string howOften = steps.count == 1 ? "once" : std::to_string(steps.count) + " times";
    tell("the clock of " + _name + " jumps " + howOften + ", first from " + timestamp(steps.from) + " to " +
         timestamp(steps.to) + "; displays are due every 2 s from there on");
  }

  void tellLeftOut(std::uint64_t count) const {
    if (count == 0) return;
    tell(_name + " brought more than 16 MiB at a time: " + std::to_string(count) +
         " of its messages were decoded, but their raw bytes were not kept");
  }

  // Writes the outputs that need the whole capture.
  void writeSummary(const Value& display) const {
    switch (_options.output) {
      case Output::Display:
        writeOutput(stdout, heading() + withSummary(display));
        break;
      case Output::StatisticsTable:
        writeOutput(stdout, heading() + _statistics.asTable());
        break;
      case Output::StatisticsJson:
        writeOutput(stdout, _statistics.asJson(_captureName));
        break;
      case Output::EveryDisplay:
      case Output::ValueTable:
      case Output::Events:
        break;
    }
  }

  // A summary stands where the reader looks first: a terminal shows the end of a long text.
  std::string withSummary(const Value& display) const {
    std::string text = _options.writeDisplay(display);
    const std::string summary =
        _options.writeDisplay == displayAsText ? radioSummary(display) : std::string();
    if (summary.empty()) return text;
    return ::isatty(STDOUT_FILENO) ? text + "\n" + summary : summary + "\n" + text;
  }

  std::string heading() const {
    if (!_options.namesEachCapture) return {};
    return (_isFirst ? "==> " : "\n==> ") + printable(_name) + " <==\n";
  }

  bool writesStatistics() const {
    return _options.output == Output::StatisticsTable || _options.output == Output::StatisticsJson;
  }

  bool isCountedForOthers() const { return _notes && _notes->statistics; }

  bool countsMessages() const { return isCountedForOthers() || writesStatistics(); }

  const Options& _options;
  DecodingNotes* const _notes;  // null when nobody wants to know
  const std::string _path;
  const std::string _name;  // for errors and headings
  const bool _isFirst;
  std::optional<std::string> _captureName;  // as in the output; absent for a single capture
  NumberFormats _formats;                   // of the streamed output
  Subscriptions _subscriptions;
  RecordOutputs _outputs;
  MessageStatistics _statistics;
  TechnologyGuess _guess;
  std::vector<Sink> _sinks;
  DisplayEvents _events;
  EventWriter _eventWriter;
  std::optional<GpxTrack> _track;  // refers to the generator while that decodes
  bool _hasTrackFailed = false;
  ElapsedTime _elapsed;
  Dating _dating = Dating::Known;  // of the last record
  bool _isOutputBroken = false;
};

}  // namespace

std::string commonCsvHeader(const Options& options, const DecodingServices& services) {
  std::set<std::string> technologies;
  if (options.style.valuesAs == ValuesAs::Numbers) {
    for (const std::string& path : options.captures) {
      const auto possible =
          possibleTechnologies(technologyIn(path, options, services.technologies), services);
      technologies.insert(possible.begin(), possible.end());
    }
  }
  const NumberFormats formats =
      numberFormatsOf({technologies.begin(), technologies.end()}, services.services);
  return csvHeader(options.tablePaths, TableColumns::CaptureTimeAndValues, formats);
}

int decodeInput(const Options& options, std::size_t index, const DecodingServices& services,
                DecodingNotes* notes) {
  return InputDecoding(options, index, notes).run(services);
}

}  // namespace varnel
