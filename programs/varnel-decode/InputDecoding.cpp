#include "programs/varnel-decode/InputDecoding.h"

#include <algorithm>
#include <cstdio>
#include <memory>
#include <optional>
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
#include "host/WholeFile.h"
#include "host/captures/Capture.h"
#include "programs/varnel-decode/ElapsedTime.h"
#include "programs/varnel-decode/GenerationWriters.h"
#include "programs/varnel-decode/MessageStatistics.h"
#include "programs/varnel-decode/OfflineDecoder.h"
#include "programs/varnel-decode/PlotRecorder.h"
#include "programs/varnel-decode/ProgramError.h"
#include "programs/varnel-decode/ProgressBar.h"
#include "programs/varnel-decode/RecordOutputs.h"
#include "programs/varnel-decode/SnapshotFile.h"
#include "programs/varnel-decode/StandardOutput.h"
#include "programs/varnel-decode/Subscriptions.h"
#include "programs/varnel-decode/TechnologyFormats.h"
#include "programs/varnel-decode/TechnologyGuess.h"
#include "programs/varnel-decode/Timestamps.h"

namespace varnel {

namespace {

constexpr int generalError = 1;

void writeFile(const std::string& path, ByteView bytes) {
  if (const auto failure = writeOutputFile(path, bytes))
    throw std::system_error(failure, "cannot write " + path);
}

ByteView bytesOf(const std::string& text) {
  return {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()};
}

// What the options ask for, of one capture or snapshot.
class InputDecoding {
 public:
  InputDecoding(const Options& options, std::size_t index)
      : _options(options),
        _path(options.captures[index]),
        _name(captureName(_path)),
        _isFirst(index == 0),
        _seen(watchedPaths(options)),
        _subscriptions(options.subscription),
        _outputs(options) {
    if (options.captures.size() > 1) _captureName = _path;
    if (options.plot) _recorder.emplace(options.plot->paths);
  }

  int run(const DecodingServices& services) {
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

 private:
  static std::vector<std::string> watchedPaths(const Options& options) {
    std::vector<std::string> paths = options.tablePaths;
    if (options.plot) paths.insert(paths.end(), options.plot->paths.begin(), options.plot->paths.end());
    return paths;
  }

  void startStream(const std::optional<std::string>& technology, const DecodingServices& services) {
    _formats = formatsFor(_options, technology, services);
    if (_options.output == Output::EveryDisplay)
      _streamed = std::make_unique<EveryDisplay>(stdout, _captureName, _options.style, _formats);
    if (_options.output == Output::ValueTable)
      _streamed =
          std::make_unique<ValueTable>(stdout, _options.tablePaths, _captureName, _options.style, _formats);
  }

  // What the user says overrules what the capture says.
  static std::optional<std::string> technologyOf(const Capture& capture, const Options& options,
                                                 const std::vector<std::string>& technologies) {
    if (options.technology) return options.technology;
    const auto named = capture.technology();
    const bool isKnown = named && std::ranges::find(technologies, *named) != technologies.end();
    return isKnown ? named : std::nullopt;
  }

  int decodeCapture(Capture& capture, const DecodingServices& services) {
    if (isConvertingAlone()) return convert(capture);
    const auto technology = technologyOf(capture, _options, services.technologies);
    if (!technology)
      return mistake("--technology is needed to decode " + _name + ", a capture that names none").code;
    startStream(technology, services);
    const int status = decodeCaptureOf(*technology, capture, services);
    tellGuess(*technology, services);
    return status;
  }

  int decodeCaptureOf(const std::string& technology, Capture& capture, const DecodingServices& services) {
    _outputs.open();
    HostLog log({.standardErrorLevel = _options.logLevel, .systemLog = HostLog::SystemLog::Unused});
    const auto generator = LogGenerator::generatorFromTechnology(technology, services.services);
    OfflineDecoder decoder(*generator, services.clock, isSaving() ? RawBytes::Kept : RawBytes::NotKept);

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
    isDone &= drawPicture();
    isDone &= succeeds([&] { writeSummary(display); });
    return isDone && !_isOutputBroken ? 0 : generalError;
  }

  static int failWithout(const std::string& displayTemplate) {
    tell("the display template " + (resourceFolder() / (displayTemplate + ".plist")).string() +
         " is missing or damaged, so nothing can be shown; install it, or name the folder that has it by "
         "VARNEL_RESOURCES");
    return generalError;
  }

  // When there are some, tells what users should know of those that were not decoded.
  void requireRecords(const OfflineDecoder& decoder) const {
    const auto remark = _subscriptions.remark(_name);
    if (!decoder.hasStarted())
      throw std::runtime_error(remark.value_or(_name + " has no records, so there is nothing to show"));
    if (remark) tell(*remark);
  }

  // Whether nobody wants to see what the records say.
  bool isConvertingAlone() const {
    return !_outputs.areNone() && _options.output == Output::Display &&
           _options.writeDisplay == displayAsNothing && !_recorder && !isSaving();
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

  // Without records earlier files stay.
  bool finishOutputs() { return _subscriptions.counts().empty() || _outputs.finish(_name); }

  // Counts the record and writes it to the outputs. Whether it is to be decoded.
  bool pass(const CaptureRecord& record) {
    const bool isChosen = _subscriptions.take(record);
    // What nobody has chosen is kept where nothing is mixed up by it.
    if (isChosen || !_options.subscription) _outputs.write(record);
    return isChosen;
  }

  void read(Capture& capture, const LogGenerator& generator, OfflineDecoder& decoder, HostLog& log,
            const TemplateWatch& templates) {
    const bool isStreaming = _options.output == Output::EveryDisplay || _options.output == Output::ValueTable;
    ProgressBar progress(
        capture,
        isStreaming ? ProgressBar::Output::GoesToTerminalAlongside : ProgressBar::Output::LeavesTerminalAlone,
        log, _options.logLevel);
    const bool isCounting = countsMessages();
    CaptureRecord record;
    while (!isPointless() && !templates.missing() && capture.next(record)) {
      progress.recordRead();
      if (!pass(record)) continue;
      if (isCounting || !_guess.isAnyKnown()) count(record.message, generator.fateOf(record.message));
      if (const auto generation = decoder.fireTicks(record.time)) report(*generation);
      _elapsed.record(record.time);
      _dating = record.dating;
      decoder.deliver(record.time, record.message);
    }
  }

  void count(ByteView message, const MessageFate& fate) {
    if (countsMessages()) _statistics.add(fate);
    if (!_guess.isAnyKnown()) _guess.take(message, fate);
  }

  // The technology is more likely wrong than the capture.
  void tellGuess(const std::string& technology, const DecodingServices& services) const {
    if (!_guess.isNeeded() || services.templates.missing()) return;
    tell(_guess.sentence(_name, technology, services.technologies, services.services));
  }

  int showSnapshot(ByteWindow& bytes, const DecodingServices& services) {
    startStream(_options.technology, services);
    if (countsMessages())
      return mistake("--stats counts the messages of captures, but " + _name + " is a snapshot").code;
    if (!_outputs.areNone())
      return mistake("--records, --pcap and --framed write the records of captures, but " + _name +
                     " is a snapshot")
          .code;
    if (_options.subscription)
      return mistake("--sim chooses among the records of captures, but " + _name + " is a snapshot").code;
    if (_options.snapshotPath)
      return mistake("--snapshot saves what was decoded of a capture, but " + _name + " is a snapshot").code;
    std::optional<SnapshotFile> snapshot;
    if (!succeeds([&] { snapshot.emplace(bytes, _name); })) return generalError;
    bool isDone = !wantsGenerations() || succeeds([&] {
      for (const Generation& generation : snapshot->generations()) {
        _elapsed.record(generation.time);
        report(generation);
      }
    });
    isDone &= writeBinaryLog(snapshot->items());
    isDone &= drawPicture();
    isDone &= succeeds([&] { writeSummary(snapshot->shown()); });
    return isDone && !_isOutputBroken ? 0 : generalError;
  }

  bool wantsGenerations() const { return _streamed || _recorder; }

  // An output that has failed gets no more; what goes to files goes on.
  void report(Generation generation) {
    generation.dating = _dating;
    generation.elapsed = _elapsed.at(generation.time);
    _isAnyShown = true;
    _hasEmptyTimes |= _options.output == Output::ValueTable && _dating == Dating::Unknown;
    if (wantsGenerations()) _seen.take(generation);
    if (_recorder) _recorder->take(generation);
    if (!_streamed || succeeds([&] { _streamed->take(generation); })) return;
    _streamed.reset();
    _isOutputBroken = true;
  }

  // Whether nobody would see what else the capture holds.
  bool isPointless() const { return _isOutputBroken && !_recorder && !isSaving() && _outputs.areNone(); }

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

  // Values that are no numbers, such as states, have no place in a picture.
  void tellUnplottedPaths() const {
    if (!_recorder) return;
    for (const auto& [path, value] : _recorder->unplotted()) {
      std::string line = "no value of " + _name;
      line.append(" under '").append(path).append("' begins with a number (one is '").append(value);
      tell(line + "'), so no line shows it");
    }
  }

  void tellEmptyTimes() const {
    if (!_hasEmptyTimes || isPointless()) return;
    const bool isElapsedShown = std::ranges::any_of(
        _options.tablePaths, [](const std::string& path) { return treePath(path) == elapsedPath; });
    if (!isElapsedShown)
      tell("the modem of " + _name +
           " knew no date, so rows have no time; the path Elapsed gives the seconds since the first record");
  }

  bool drawPicture() const {
    tellUnseenPaths();
    tellEmptyTimes();
    tellUnplottedPaths();
    return !_recorder || succeeds([&] {
      if (_recorder->isEmpty())
        throw std::runtime_error(_name + " has no number under the paths to plot, so " + _options.plot->file +
                                 " was not written; --format paths shows what there is");
      writeFile(_options.plot->file, bytesOf(drawPlot(_recorder->plot(_name))));
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

  // A cell may never have been met; more likely its name was mistyped. Nothing is known when not all was
  // looked at, and another line says so when there was nothing to see.
  void tellUnseenPaths() const {
    if (isPointless() || !_isAnyShown || _guess.isNeeded()) return;
    for (const std::string& path : _seen.unseen())
      tell("no display of " + _name + " has a value under '" + path + "'; " + adviceFor(path));
  }

  std::string adviceFor(const std::string& path) const {
    const auto nearest = _seen.nearestTo(path);
    if (nearest.empty()) return "--format paths shows what there is";
    std::string advice = "did you mean ";
    for (std::size_t i = 0; i < nearest.size(); ++i) {
      if (i > 0) advice += i + 1 < nearest.size() ? ", " : " or ";
      advice.append("'").append(nearest[i]).append("'");
    }
    return advice + "?";
  }

  // What is written once all is read.
  void writeSummary(const Value& display) const {
    switch (_options.output) {
      case Output::Display:
        writeOutput(stdout, heading() + _options.writeDisplay(display));
        break;
      case Output::StatisticsTable:
        writeOutput(stdout, heading() + _statistics.asTable());
        break;
      case Output::StatisticsJson:
        writeOutput(stdout, _statistics.asJson(_captureName));
        break;
      case Output::EveryDisplay:
      case Output::ValueTable:
        break;
    }
  }

  std::string heading() const {
    if (!_options.namesEachCapture) return {};
    return (_isFirst ? "==> " : "\n==> ") + printable(_name) + " <==\n";
  }

  bool countsMessages() const {
    return _options.output == Output::StatisticsTable || _options.output == Output::StatisticsJson;
  }

  const Options& _options;
  const std::string _path;
  const std::string _name;  // as errors and headings tell it
  const bool _isFirst;
  std::optional<std::string> _captureName;    // in the output; absent when there is but one
  NumberFormats _formats;                     // of what is streamed
  std::unique_ptr<GenerationSink> _streamed;  // to standard output
  std::optional<PlotRecorder> _recorder;
  SeenPaths _seen;
  Subscriptions _subscriptions;
  RecordOutputs _outputs;
  MessageStatistics _statistics;
  TechnologyGuess _guess;
  ElapsedTime _elapsed;
  Dating _dating = Dating::Known;  // of the last record
  bool _isAnyShown = false;
  bool _hasEmptyTimes = false;  // in a table
  bool _isOutputBroken = false;
};

}  // namespace

NumberFormats formatsFor(const Options& options, const std::optional<std::string>& technology,
                         const DecodingServices& services) {
  if (options.style.valuesAs == ValuesAs::Texts) return {};
  return numberFormatsOf(technology, services.technologies, services.services);
}

int decodeInput(const Options& options, std::size_t index, const DecodingServices& services) {
  return InputDecoding(options, index).run(services);
}

}  // namespace varnel
