#include <gmock/gmock.h>

#include <fstream>
#include <string>
#include <string_view>
#include <vector>

#include "programs/varnel-telephonyd/simulation/SimulatedModem.h"
#include "tests/varnel-decode/DecodeProgram.h"

// What a capture takes does not depend on how long it is: neither the memory nor the time for a message.

namespace varnel {
namespace {

constexpr std::uint32_t shortCapture_s = 20;  // more than the history reaches back
constexpr std::uint32_t longCapture_s = 8 * shortCapture_s;
constexpr std::size_t bytesASecond = 100'000;

struct Cost {
  std::size_t memory;
  std::chrono::microseconds time;
};

class LongCapture : public DecodeProgram {
 protected:
  // The first messages of a simulated modem, over and over, close together. Written as they come, for the
  // memory of the test would count as that of the program.
  std::string capture(std::string_view technology, std::uint32_t duration_s) const {
    constexpr int differentMessages = 1000;
    const auto modem = simulatedModem(technology, 1);
    std::vector<std::string> messages;
    for (int i = 0; i < differentMessages; ++i) {
      const Bytes bytes = modem->next().bytes;
      messages.emplace_back(bytes.begin(), bytes.end());
    }
    const std::string path = folder.file("walk-" + std::to_string(duration_s));
    std::ofstream file(path, std::ios::binary);
    file << pcapHeader();
    std::size_t count = 0;
    for (std::uint32_t second = 0; second < duration_s; ++second) {
      for (std::size_t size = 0; size < bytesASecond;) {
        const std::string record = pcapRecord(afternoon + second, 0, messages[count++ % messages.size()]);
        size += record.size();
        file << record;
      }
    }
    return path;
  }

  static Cost cost(std::vector<std::string> arguments) {
    arguments.insert(arguments.end(), {"--log-level", "-1"});
    // A sanitizer would keep what was freed for a while.
    Process process(VARNEL_DECODE_PROGRAM, std::move(arguments),
                    {"ASAN_OPTIONS=quarantine_size_mb=1:thread_local_quarantine_size_kb=64"});
    EXPECT_TRUE(process.waitForEnd());
    EXPECT_EQ(process.exitStatus(), 0) << process.error();
    EXPECT_EQ(process.error(), "");
    return {process.peakMemory(), process.processorTime()};
  }

  void expectSameCost(std::string_view technology, const std::string& value) const {
    const auto everything = [&](std::uint32_t duration_s) {
      return cost({"--technology", std::string(technology), capture(technology, duration_s), "--dlf",
                   folder.file("walk.dlf"), "--plot", folder.file("walk.svg"), value, "--csv", value});
    };
    const Cost shortCost = everything(shortCapture_s), longCost = everything(longCapture_s);
    // The long one is 14 MB longer.
    EXPECT_LT(longCost.memory, shortCost.memory + 4'000'000);
    // Eight times as long, and as much again for what else the processor has to do.
    EXPECT_LT(longCost.time, 16 * shortCost.time);
  }
};

TEST_F(LongCapture, OfLTETakesNoMoreMemoryThanAShortOneAndNoMoreTimeForAMessage) {
  expectSameCost("kalvi-lte", "Serving Cell Measurements/Average RSRP");
}

TEST_F(LongCapture, OfGSMAndUMTSTakesNoMoreMemoryThanAShortOneAndNoMoreTimeForAMessage) {
  expectSameCost("kalvi-gsm-umts", "UMTS/UMTS RR Info/UARFCN");
}

TEST_F(LongCapture, CountingTakesNoMoreMemoryAndNoMoreTimeForAMessage) {
  const auto counting = [&](std::uint32_t duration_s) {
    return cost({"--technology", "kalvi-lte", "--stats", capture("kalvi-lte", duration_s)});
  };
  const Cost shortCost = counting(shortCapture_s), longCost = counting(longCapture_s);
  EXPECT_LT(longCost.memory, shortCost.memory + 4'000'000);
  EXPECT_LT(longCost.time, 16 * shortCost.time);
}

}  // namespace
}  // namespace varnel
