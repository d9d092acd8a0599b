#include <benchmark/benchmark.h>

#include <numeric>

#include "BenchmarkServices.h"
#include "LogGenerator/KLV/LTE/LTELogGenerator.h"
#include "platform/PropertyList.h"
#include "platform/TelephonyService.h"

namespace varnel {
namespace {

// A message's way through the generator: framing, dispatch, decoding, and the raw bytes kept for the binary
// log.
void decode(benchmark::State& benchmarkState, const Bytes& message) {
  constexpr int messagesPerDisplay = 256;
  BenchmarkServices host;
  LTELogGenerator generator(host.services());
  Dictionary state;
  int untilDisplay = messagesPerDisplay;
  for (auto _ : benchmarkState) {
    generator.updateState_withData(state, message);
    if (--untilDisplay == 0) {
      benchmarkState.PauseTiming();
      generator.generateLogUsingState(state);
      untilDisplay = messagesPerDisplay;
      benchmarkState.ResumeTiming();
    }
  }
  benchmarkState.SetItemsProcessed(benchmarkState.iterations());
  benchmarkState.SetBytesProcessed(benchmarkState.iterations() * static_cast<std::int64_t>(message.size()));
}

void LTEServingCellIdentity(benchmark::State& state) {
  Bytes message(38);
  std::iota(message.begin(), message.end(), std::uint8_t{0x21});
  message[0] = 1;
  message[3] = 0xC2;
  message[4] = 0xB0;
  decode(state, message);
}
BENCHMARK(LTEServingCellIdentity);

void LTECellMonitorOf16Records(benchmark::State& state) {
  Value cells = Value::ofArray();
  for (int i = 0; i < 16; ++i) {
    Value cell = Value::ofDictionary();
    cell.dictionary()->set(cellMonitor::radioAccessTechnology, cellMonitor::lte);
    cell.dictionary()->set(cellMonitor::cellType, i < 15 ? cellMonitor::neighbor : cellMonitor::serving);
    cell.dictionary()->set(cellMonitor::trackingAreaCode, Value::ofInteger(4711));
    cell.dictionary()->set(cellMonitor::cellIdentity, Value::ofInteger(0x1234500 + i));
    cell.dictionary()->set(cellMonitor::physicalCellIdentity, Value::ofInteger(100 + i));
    cell.dictionary()->set(cellMonitor::bandInfo, Value::ofInteger(3));
    cell.dictionary()->set(cellMonitor::uarfcn, Value::ofInteger(1300));
    cells.array()->push_back(cell);
  }
  Bytes message{0xFF, 0, 0, 1, 0, 0, 0, 0, 0, 0, 0, 0, 0};
  const Bytes payload = *writeXmlPropertyList(cells);
  message.insert(message.end(), payload.begin(), payload.end());
  decode(state, message);
}
BENCHMARK(LTECellMonitorOf16Records);

}  // namespace
}  // namespace varnel
