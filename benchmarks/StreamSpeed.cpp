#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <map>
#include <memory>
#include <ostream>
#include <string_view>
#include <vector>

#include "Floor.h"
#include "LogGenerator/LogGenerator.h"
#include "base/Log.h"
#include "host/FileResources.h"
#include "host/SystemClock.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "tests/support/AllocationCounter.h"

// Without arguments: writes the technologies, then the ways, one per line. With a technology and a way:
// writes what a message of the technology's mixed stream costs, as "NANOSECONDS ALLOCATIONS". With a number
// after them: decodes the stream this many times and measures nothing, for a program that counts the
// instructions of `measuredWay`.

namespace varnel {
namespace {

using Clock = std::chrono::steady_clock;

constexpr std::size_t messagesOfAStream = 4000;
constexpr std::size_t messagesPerDisplay = 50;
constexpr int turns = 20;

// A sink that takes trace lines and stores them where nobody reads them.
class Trace final : public LogSink {
 public:
  void write(int /*priority*/, std::string_view text) override {
    std::memcpy(_line, text.data(), std::min(text.size(), sizeof _line));
  }

 private:
  char _line[256];
};

std::vector<Bytes> streamOf(std::string_view technology) {
  const auto modem = simulatedModem(technology, 1);
  std::vector<Bytes> messages;
  while (messages.size() < messagesOfAStream) messages.push_back(modem->next().bytes);
  return messages;
}

// A generator with its real template, and the messages that it has got.
class Decoding {
 public:
  explicit Decoding(std::string_view technology)
      : _generator(LogGenerator::generatorFromTechnology(
            technology, {_resources, _clock, _application, _standardOutput})) {}

  void take(ByteView message) { _generator->updateState_withData(_state, message); }
  Value display() { return _generator->generateLogUsingState(_state); }

 private:
  const FileResources _resources{resourceFolder()};
  const SystemClock _clock;
  const ApplicationInfo _application;
  std::ostream _standardOutput{nullptr};
  Dictionary _state;
  std::unique_ptr<LogGenerator> _generator;
};

Floor floorOf(std::string_view technology, const std::vector<Bytes>& messages) {
  Decoding decoding(technology);
  Floor floor;
  decoding.display();
  for (const Bytes& message : messages) {
    markTexts(decoding.display());
    decoding.take(message);
    floor.learn(message, technology == technology::ifxGSM, takeTexts(decoding.display()));
  }
  return floor;
}

// Processes the messages from `first` up to `end`, which is not included.
using Way = std::function<void(std::size_t first, std::size_t end)>;

struct Run {
  Way way;
  std::function<void()> between;
};

Run decodingRun(std::string_view technology, const std::vector<Bytes>& messages) {
  const auto decoding = std::make_shared<Decoding>(technology);
  return {[decoding, &messages](std::size_t first, std::size_t end) {
            for (std::size_t i = first; i < end; ++i) decoding->take(messages[i]);
          },
          [decoding] { decoding->display(); }};
}

std::uint64_t witness = 0;

Run floorRun(std::string_view technology, const std::vector<Bytes>& messages) {
  const auto floor = std::make_shared<Floor>(floorOf(technology, messages));
  return {[floor](std::size_t first, std::size_t end) {
            for (std::size_t i = first; i < end; ++i) witness += floor->run(i);
          },
          [] {}};
}

Run copyRun(const std::vector<Bytes>& messages) {
  return {[&messages](std::size_t first, std::size_t end) {
            static char room[1 << 16];
            for (std::size_t i = first; i < end; ++i) {
              std::memcpy(room, messages[i].data(), std::min(messages[i].size(), sizeof room));
              witness += static_cast<unsigned char>(room[messages[i].size() / 2]);
            }
          },
          [] {}};
}

constexpr std::string_view ways[] = {"decoding", "decoding, traced", "floor", "memcpy"};

[[gnu::noinline]] void measuredWay(const Way& way, std::size_t first, std::size_t end) { way(first, end); }

struct Cost {
  double nanoseconds = 0, allocations = 0;
};

// The cost of the ways between displays, over the whole stream.
Cost goOver(const Run& run, std::size_t size) {
  Clock::duration time{};
  std::uint64_t allocated = 0;
  for (std::size_t first = 0; first < size; first += messagesPerDisplay) {
    const std::uint64_t before = allocationCount();
    const auto start = Clock::now();
    measuredWay(run.way, first, std::min(first + messagesPerDisplay, size));
    time += Clock::now() - start;
    allocated += allocationCount() - before;
    run.between();
  }
  const auto count = static_cast<double>(size);
  return {std::chrono::duration<double, std::nano>(time).count() / count,
          static_cast<double>(allocated) / count};
}

Run runOf(std::string_view technology, std::string_view way, const std::vector<Bytes>& messages) {
  if (way == "floor") return floorRun(technology, messages);
  if (way == "memcpy") return copyRun(messages);
  return decodingRun(technology, messages);
}

int measure(std::string_view technology, std::string_view way, int rounds) {
  const std::vector<Bytes> messages = streamOf(technology);
  const Run run = runOf(technology, way, messages);
  Trace trace;
  if (way == "decoding, traced") setLogSink(&trace, logNoticePriority);
  goOver(run, messages.size());  // the first run fills the display
  for (int i = 0; i < rounds; ++i) goOver(run, messages.size());
  if (rounds > 0) return 0;
  const Run floor = floorRun(technology, messages);
  Cost best = goOver(run, messages.size()), bestFloor = goOver(floor, messages.size());
  for (int i = 0; i < turns; ++i) {
    best.nanoseconds = std::min(best.nanoseconds, goOver(run, messages.size()).nanoseconds);
    bestFloor.nanoseconds = std::min(bestFloor.nanoseconds, goOver(floor, messages.size()).nanoseconds);
  }
  setLogSink(nullptr, -1);
  std::printf("%.1f %.2f %.1f\n", best.nanoseconds, best.allocations, bestFloor.nanoseconds);
  return witness == 42 ? 1 : 0;  // uses the results of the floor
}

}  // namespace
}  // namespace varnel

int main(int argumentCount, char** arguments) {
  using namespace varnel;
  if (argumentCount < 3) {
    for (const auto technology : simulatedTechnologies()) std::printf("technology %s\n", technology.data());
    for (const auto way : ways) std::printf("way %s\n", way.data());
    return 0;
  }
  return measure(arguments[1], arguments[2], argumentCount > 3 ? std::atoi(arguments[3]) : 0);
}
