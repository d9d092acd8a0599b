#include <benchmark/benchmark.h>

#include <string>

#include "DecodingLoop.h"

namespace varnel {
namespace {

// The way of a message through the generator: framing, dispatch, decoding, and keeping the raw bytes for the
// binary log.
void decode(benchmark::State& state, const PacketCase& packetCase) {
  constexpr int messagesPerDisplay = 256;
  DecodingLoop loop(packetCase);
  int untilDisplay = messagesPerDisplay;
  for (auto _ : state) {
    loop.decode();
    if (--untilDisplay > 0) continue;
    state.PauseTiming();
    loop.display();
    untilDisplay = messagesPerDisplay;
    state.ResumeTiming();
  }
  state.SetItemsProcessed(state.iterations());
  state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(loop.message().size()));
}

const bool areRegistered = [] {
  for (const PacketCase& packetCase : packetCases()) {
    benchmark::RegisterBenchmark(packetCase.name.c_str(), decode, packetCase);
  }
  return true;
}();

}  // namespace
}  // namespace varnel
