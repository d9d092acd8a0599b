#include "fuzz/GeneratorRun.h"

#include <algorithm>
#include <deque>
#include <memory>
#include <string>

#include "LogGenerator/KLV/Subscriber/SimInfo.h"
#include "LogGenerator/KLVLogGenerator.h"
#include "LogGenerator/LogGenerator.h"
#include "app/Snapshot.h"
#include "base/Assertion.h"
#include "base/PropertyList.h"
#include "fuzz/ChosenInputs.h"
#include "fuzz/DisplayChecks.h"
#include "fuzz/FuzzHost.h"
#include "fuzz/InputSteps.h"
#include "fuzz/MessageRules.h"
#include "fuzz/Require.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::size_t largestHistory = 5;
// More per input would find nothing new and take long. There are more displays than the history holds.
constexpr std::size_t mostDisplays = 7, mostSaves = 3, mostReconnections = 2;

bool hasOneEntry(const Value& value) { return value.dictionary() && value.dictionary()->size() == 1; }

// Whether the display of an object message consists of texts and containers, and no dictionary with one entry
// is inside another container.
bool isCollapsed(const Value& object) {
  const auto isFine = [](const Value& child) { return !hasOneEntry(child) && isCollapsed(child); };
  if (object.string()) return true;
  if (const Array* elements = object.array()) return std::ranges::all_of(*elements, isFine);
  const Dictionary* entries = object.dictionary();
  return entries && std::ranges::all_of(*entries, [&](const auto& entry) { return isFine(entry.value); });
}

void checkSnapshot(const Value& snapshot) {
  require(writeBinaryPropertyList(snapshot).has_value(), "every snapshot has a binary form");
  require(writeXmlPropertyList(snapshot) || holdsTextStrangeToXml(snapshot),
          "XML refuses only texts that it cannot hold");
}

/// A generator with its state, and the results that both must have.
class GeneratorRun {
 public:
  GeneratorRun(std::string_view technology, const Services& services)
      : _technology(technology), _services(services) {
    reconnect();
  }

  /// False when the message has ended the program, as it must.
  bool take(ByteView message) {
    const Outcome required = requiredOutcome(_technology, message);
    const Outcome outcome = outcomeOf(message);
    require(outcome == required, "exactly the messages that must end the program end it");
    if (outcome != Outcome::Accepted) return false;
    const ByteView logged = loggedBytes(_technology, message);
    _interval.insert(_interval.end(), logged.begin(), logged.end());
    _hasDisplay = true;
    return true;
  }

  /// Returns the display.
  Value generate() {
    Value display = _generator->generateLogUsingState(_state);
    require(_hasDisplay == !display.isAbsent() || isThereFromTheFirst(),
            "there is a display once it has been built");
    require(!isThereFromTheFirst() || display.dictionary(), "the display is there from the first");
    if (isObjectStream())
      require(display.isAbsent() || isCollapsed(display),
              "an object is shown without dictionaries of one entry");
    else
      _hasDisplay = true;
    _intervals.push_back(std::move(_interval));
    _interval.clear();
    if (_intervals.size() > largestHistory) _intervals.pop_front();
    checkHistory();
    return display;
  }

  /// Returns what would be saved.
  Value save() {
    Value contents = _generator->getSaveContentsFromState(_state);
    const Array* items = contents.array();
    require(items && items->size() == _intervals.size() + (isObjectStream() ? 0 : 1),
            "the records and the binary log are saved");
    if (!isObjectStream()) checkBinaryLog(items->back());
    return contents;
  }

  /// A new generator takes over the state. Messages that no display has shown yet are lost.
  void reconnect() {
    _generator = LogGenerator::generatorFromTechnology(_technology, _services);
    _interval.clear();
  }

 private:
  bool isObjectStream() const { return _technology == technology::ifxGSM; }
  bool isThereFromTheFirst() const {
    return _technology == technology::kalviCDMA || _technology == technology::allRadios;
  }

  Outcome outcomeOf(ByteView message) {
    try {
      _generator->updateState_withData(_state, message);
    } catch (const LogCode_0xFF0000::UnknownDataException&) {
      return Outcome::UnreadableSimFiles;
    } catch (const AssertionFailure& failure) {
      return failure.line() == 90 ? Outcome::NoPropertyList : Outcome::UnknownObject;
    }
    return Outcome::Accepted;
  }

  void checkHistory() const {
    const Array* history = _state.get(stateKey::history).array();
    require(history && history->size() == _intervals.size(), "the history holds the last five displays");
    if (isObjectStream()) return;
    for (std::size_t i = 0; i < _intervals.size(); ++i) {
      const Bytes* raw = (*history)[i].dictionary()->get(stateKey::displayState).data();
      require(raw && *raw == _intervals[i], "a record holds the accepted messages of its interval");
    }
  }

  void checkBinaryLog(const Value& item) const {
    const Bytes* log = item.dictionary()->get("DLF").data();
    require(log && log->size() >= dlfVersionReportLength, "the binary log begins with its version report");
    Bytes expected(log->begin(), log->begin() + dlfVersionReportLength);
    for (const Bytes& interval : _intervals) {
      if (interval.size() > 1) expected.insert(expected.end(), interval.begin() + 1, interval.end());
    }
    require(*log == expected, "the binary log is the intervals, each without its first byte");
    const std::string* text = item.dictionary()->get("Description").string();
    require(text && *text == "DLF binary (" + std::to_string(expected.size()) + " bytes)",
            "the binary log is described by its length");
  }

  const std::string _technology;
  const Services _services;
  std::unique_ptr<LogGenerator> _generator;
  Dictionary _state;
  bool _hasDisplay = false;
  Bytes _interval;               // raw messages since the last display
  std::deque<Bytes> _intervals;  // raw messages of the displays in the history
};

// Takes many times as long as everything else, so only few inputs get these checks.
void inspect(GeneratorRun& run, ByteView input, Time now) {
  constexpr std::size_t inputsPerTree = 256, inputsPerWriting = 1024;
  const Value display = run.generate();
  if (isChosen(input, inputsPerTree)) checkTree(display);
  if (!isChosen(input, inputsPerWriting)) return;
  checkFormats(display);
  checkSnapshot(snapshotContents(now, run.save(), "from outside"));
}

}  // namespace

int fuzzGenerator(std::string_view technology, ByteView input) {
  static FuzzHost host;
  const Services services = host.services(host.shipped);
  GeneratorRun run(technology, services);
  std::size_t displays = 0, saves = 0, reconnections = 0;
  ByteView rest = input;
  while (const auto step = takeStep(rest)) {
    if (technology == technology::ifxGSM && isLaborious(step->message, messageLimits)) return 0;
    if (!run.take(step->message)) return 0;
    if (step->after & Reconnect && reconnections++ < mostReconnections) run.reconnect();
    if (step->after & Generate && displays++ < mostDisplays) run.generate();
    if (step->after & Save && saves++ < mostSaves) run.save();
  }
  inspect(run, input, services.clock.now());
  return 0;
}

}  // namespace varnel
