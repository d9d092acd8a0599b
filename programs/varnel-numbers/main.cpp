#include <sys/prctl.h>
#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <ostream>
#include <string>

#include "LogGenerator/LogGenerator.h"
#include "app/ValueHistory.h"
#include "host/BuildInfo.h"
#include "host/FileResources.h"
#include "host/ProgramStart.h"
#include "host/Subscription.h"
#include "host/TerminateHandler.h"
#include "host/captures/Capture.h"
#include "model/VarnelModelNode.h"
#include "model/events/DisplayEvents.h"
#include "platform/TelephonyService.h"
#include "programs/shared/CaptureClock.h"
#include "programs/shared/NumberStream.h"
#include "programs/shared/OfflineDecoder.h"

// Decodes a capture for the viewer and tells it the numbers of each display. It is a process of its own: a
// message that must end the program ends only this one, and the lock of the arrays, which a thread may keep
// forever, is not shared with the viewer.

namespace varnel {

namespace {

constexpr const char* programName = "varnel-numbers";
constexpr int usageError = 2;
constexpr std::uint64_t recordsBetweenNotes = 512;

// Ends the program when the viewer has gone.
void writeToViewer(std::string_view bytes) {
  while (!bytes.empty()) {
    const ssize_t written = ::write(STDOUT_FILENO, bytes.data(), bytes.size());
    if (written < 0 && errno == EINTR) continue;
    if (written <= 0) std::_Exit(EXIT_FAILURE);
    bytes.remove_prefix(static_cast<std::size_t>(written));
  }
}

// Collects the pieces of a display.
class Output {
 public:
  void write(std::string_view bytes) { _bytes.append(bytes); }
  void flush() {
    writeToViewer(_bytes);
    _bytes.clear();
  }

 private:
  std::string _bytes;
};

class Reading {
 public:
  Reading(Capture& capture, const std::string& technology, std::optional<std::uint8_t> subscription)
      : _capture(capture),
        _filter(subscription, unaskedOf(technology)),
        _resources(resourceFolder()),
        _application(applicationInfo()),
        _generator(LogGenerator::generatorFromTechnology(
            technology, {_resources, _clock, _application, _nowhere, Identities::Hidden})),
        _decoder(*_generator, _clock, RawBytes::NotKept),
        // Samples are told at once. What is kept tells only which of them a packet has renewed.
        _history(_generator->numberFormats(), {.length = std::chrono::minutes(1), .bytes = 32U << 20}) {}

  void run() {
    std::string why;
    try {
      CaptureRecord record;
      for (std::uint64_t count = 0; _capture.next(record); ++count) {
        if (count % recordsBetweenNotes == 0) tellProgress();
        if (_filter.takes(record.subscription)) take(record);
      }
    } catch (const CaptureError& error) {
      why = error.what();
    }
    if (_decoder.hasStarted()) tell({_clock.now(), _decoder.finish()});
    _writer.end(why);
    _output.flush();
  }

 private:
  void take(const CaptureRecord& record) {
    if (!_decoder.hasStarted()) {
      _writer.begin(record.dating == Dating::Known);
      // The axis begins at the first record, not at the first display.
      _writer.generation(record.time, {});
    }
    if (const auto generation = _decoder.fireTicks(record.time)) tell(*generation);
    _decoder.deliver(record.time, record.message);
    for (const DisplayEvent& event : _events.lookAt(_decoder.display(), _decoder.now())) _writer.event(event);
  }

  void tell(const Generation& generation) {
    PathDictionary paths;
    _history.add(
        VarnelModelNode::makeTreeFromObject_withPathDictionary(generation.display, paths, *_generator),
        generation.time);
    _writer.generation(generation.time, _history.newestReadings());
    // The next message may be one that ends the program.
    _output.flush();
  }

  void tellProgress() {
    const auto size = _capture.fileSize();
    if (!size || *size == 0) return;
    const double share = static_cast<double>(_capture.bytesRead()) / static_cast<double>(*size);
    _writer.progress(std::clamp(share, 0.0, 1.0));
    _output.flush();
  }

  Capture& _capture;
  SubscriptionFilter _filter;
  std::ostream _nowhere{nullptr};
  CaptureClock _clock;
  const FileResources _resources;
  const ApplicationInfo _application;
  std::unique_ptr<LogGenerator> _generator;
  OfflineDecoder _decoder;
  ValueHistory _history;
  DisplayEvents _events;
  Output _output;
  NumberStreamWriter _writer{[this](std::string_view bytes) { _output.write(bytes); }};
};

std::string technologyOf(const Capture& capture, const std::string& wanted) {
  const auto known = LogGenerator::technologies();
  const std::string named = wanted.empty() ? capture.technology().value_or("") : wanted;
  return std::ranges::find(known, named) == known.end() ? std::string(technology::allRadios) : named;
}

std::optional<std::uint8_t> subscriptionIn(std::string_view text) {
  std::uint8_t number = 0;
  const auto [end, failure] = std::from_chars(text.data(), text.data() + text.size(), number);
  const bool isNumber = failure == std::errc() && end == text.data() + text.size() && number > 0;
  return isNumber ? std::optional(number) : std::nullopt;
}

int run(const std::string& path, const std::string& technology, const std::string& subscription) {
  try {
    const auto capture = openCapture(path);
    Reading(*capture, technologyOf(*capture, technology), subscriptionIn(subscription)).run();
  } catch (const CaptureError& error) {
    NumberStreamWriter(writeToViewer).end(error.what());
  }
  return EXIT_SUCCESS;
}

}  // namespace

}  // namespace varnel

int main(int argumentCount, char** arguments) {
  varnel::startProgram();
  varnel::installTerminateHandler(varnel::programName);
  if (argumentCount != 4) {
    std::fprintf(stderr, "%s: the viewer starts this program by itself; use varnel or varnel-decode\n",
                 varnel::programName);
    return varnel::usageError;
  }
  // The viewer comes first, and nobody needs the rest of the work when it has gone.
  ::setpriority(PRIO_PROCESS, 0, 10);
  ::prctl(PR_SET_PDEATHSIG, SIGKILL);
  constexpr rlimit none{0, 0};
  ::setrlimit(RLIMIT_CORE, &none);
  return varnel::run(arguments[1], arguments[2], arguments[3]);
}
