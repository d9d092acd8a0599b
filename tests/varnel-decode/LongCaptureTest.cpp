#include <gmock/gmock.h>

#include <algorithm>
#include <fstream>
#include <string>
#include <string_view>
#include <vector>

#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "tests/varnel-decode/DecodeProgram.h"

// The cost of a capture does not depend on its length: neither the memory nor the time per message.

namespace varnel {
namespace {

constexpr std::uint32_t shortCapture_s = 20;  // longer than the history reaches back
constexpr std::uint32_t longCapture_s = 8 * shortCapture_s;
constexpr std::size_t bytesASecond = 100'000;

struct Cost {
  std::size_t memory;
  std::chrono::microseconds time;
  std::string error;
};

enum class ItsClock { Runs, StandsInThePastSinceTheFirstSecond };

class LongCapture : public DecodeProgram {
 protected:
  // The first messages of a simulated modem, again and again, close together. Nothing is allocated, since the
  // memory of the test would count as memory of the program.
  std::string capture(std::string_view technology, std::uint32_t duration_s, ItsClock clock) const {
    constexpr std::size_t differentMessages = 1000;
    const auto modem = simulatedModem(technology, 1);
    std::vector<std::string> records;
    while (records.size() < differentMessages) {
      const Bytes bytes = modem->next().bytes;
      records.push_back(pcapRecord(0, 0, std::string(bytes.begin(), bytes.end())));
    }
    const std::string path = folder.file("walk-" + std::to_string(duration_s));
    std::ofstream file(path, std::ios::binary);
    file << pcapHeader();
    std::size_t count = 0;
    for (std::uint32_t second = 0; second < duration_s; ++second) {
      const bool isSetBack = clock == ItsClock::StandsInThePastSinceTheFirstSecond && second > 0;
      const std::string time = littleEndian(isSetBack ? afternoon - 3600 : afternoon + second, 4);
      for (std::size_t size = 0; size < bytesASecond; ++count) {
        std::string& record = records[count % records.size()];
        record.replace(0, time.size(), time);
        size += record.size();
        file << record;
      }
    }
    return path;
  }

  static Cost cost(std::vector<std::string> arguments) {
    arguments.insert(arguments.end(), {"--log-level", "-1"});
    // A sanitizer would keep freed memory for a while.
    Process process(VARNEL_DECODE_PROGRAM, std::move(arguments),
                    {"ASAN_OPTIONS=quarantine_size_mb=1:thread_local_quarantine_size_kb=64"});
    EXPECT_TRUE(process.waitForEnd());
    EXPECT_EQ(process.exitStatus(), 0) << process.error();
    return {process.peakMemory(), process.processorTime(), process.error()};
  }

  // Writes both captures first, so that the test has the same amount of memory when it starts either program.
  void expectSameCost(std::string_view technology, const std::vector<std::string>& options,
                      ItsClock clock = ItsClock::Runs) const {
    const auto costOf = [&](const std::string& path) {
      std::vector<std::string> arguments{"--technology", std::string(technology), path};
      arguments.insert(arguments.end(), options.begin(), options.end());
      return cost(arguments);
    };
    const std::string shortPath = capture(technology, shortCapture_s, clock);
    const std::string longPath = capture(technology, longCapture_s, clock);
    Cost shortCost = costOf(shortPath), longCost = costOf(longPath);
    for (const Cost& each : {shortCost, longCost})
      EXPECT_EQ(linesOf(each.error), clock == ItsClock::Runs ? 0u : 1u) << each.error;
    // The long one is 14 MB longer.
    EXPECT_LT(longCost.memory, shortCost.memory + 4'000'000);
    // Eight times as long, and twice that for other work of the processor. Work on shared caches costs time
    // now and then. A cost that grows with the square is higher every time.
    for (int left = 5; left > 0 && longCost.time >= 16 * shortCost.time; --left) {
      shortCost.time = std::min(shortCost.time, costOf(shortPath).time);
      longCost.time = std::min(longCost.time, costOf(longPath).time);
    }
    EXPECT_LT(longCost.time, 16 * shortCost.time);
  }

  std::vector<std::string> everythingAbout(const std::string& value) const {
    return {"--dlf", folder.file("walk.dlf"), "--plot", folder.file("walk.svg"), value, "--csv", value};
  }
};

TEST_F(LongCapture, OfLTETakesNoMoreMemoryThanAShortOneAndNoMoreTimeForAMessage) {
  expectSameCost("kalvi-lte", everythingAbout("Serving Cell Measurements/Average RSRP"));
}

TEST_F(LongCapture, OfGSMAndUMTSTakesNoMoreMemoryThanAShortOneAndNoMoreTimeForAMessage) {
  expectSameCost("kalvi-gsm-umts", everythingAbout("UMTS/UMTS RR Info/UARFCN"));
}

TEST_F(LongCapture, WithAClockThatStandsInThePastTakesNoMoreMemoryAndNoMoreTimeForAMessage) {
  expectSameCost("kalvi-lte", {"--every"}, ItsClock::StandsInThePastSinceTheFirstSecond);
}

TEST_F(LongCapture, CountingTakesNoMoreMemoryAndNoMoreTimeForAMessage) {
  expectSameCost("kalvi-lte", {"--stats"});
}

}  // namespace
}  // namespace varnel
