#include <benchmark/benchmark.h>

#include "app/ValueHistory.h"
#include "base/Dictionary.h"

namespace varnel {
namespace {

NumberFormats formatsOfRows(int rows) {
  NumberFormats formats;
  for (int row = 0; row < rows; ++row)
    formats.add("Section", "Row number " + std::to_string(row), real("%.2f dBm"));
  return formats;
}

std::shared_ptr<const VarnelModelNode> displayOf(int rows, std::string_view text) {
  Value section = Value::ofDictionary();
  for (int row = 0; row < rows; ++row) section.dictionary()->set("Row number " + std::to_string(row), text);
  Value display = Value::ofDictionary();
  display.dictionary()->set("Section", section);
  PathDictionary paths;
  return VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
}

// As many cells of neighbors as have ten rows in this number of rows.
std::shared_ptr<const VarnelModelNode> neighborsOf(int rows) {
  Value list = Value::ofArray();
  for (int cell = 0; cell < rows / 10; ++cell) {
    Value record = Value::ofDictionary();
    record.dictionary()->set("EARFCN", "1300");
    record.dictionary()->set("Physical Cell ID", std::to_string(cell));
    for (int row = 2; row < 10; ++row)
      record.dictionary()->set("Row number " + std::to_string(row), "-101.25 dBm");
    list.array()->push_back(record);
  }
  Value section = Value::ofDictionary();
  section.dictionary()->set("Cells", list);
  Value display = Value::ofDictionary();
  display.dictionary()->set("Section", section);
  PathDictionary paths;
  return VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
}

// One more generation of a history that already has an hour.
void addTo(ValueHistory& history, const std::shared_ptr<const VarnelModelNode>& display,
           const std::shared_ptr<const VarnelModelNode>& other, benchmark::State& state) {
  std::int64_t second = 0;
  for (; second < 3600; second += 2) history.add(display, {.seconds = second});
  bool isOdd = false;
  for (auto _ : state) {
    history.add(isOdd ? display : other, {.seconds = second});
    isOdd = !isOdd;
    second += 2;
  }
  state.counters["bytes"] = static_cast<double>(history.bytes());
}

void historyOfRows(benchmark::State& state) {
  const int rows = static_cast<int>(state.range(0));
  ValueHistory history(formatsOfRows(rows));
  addTo(history, displayOf(rows, "-101.25 dBm"), displayOf(rows, "-99.50 dBm"), state);
}
BENCHMARK(historyOfRows)->Arg(126)->Arg(500);

void historyOfNeighbors(benchmark::State& state) {
  const int rows = static_cast<int>(state.range(0));
  ValueHistory history(formatsOfRows(10));
  addTo(history, neighborsOf(rows), neighborsOf(rows), state);
}
BENCHMARK(historyOfNeighbors)->Arg(500);

void columnsOfTenMinutes(benchmark::State& state) {
  ValueHistory history(formatsOfRows(1));
  const auto display = displayOf(1, "-101.25 dBm");
  for (std::int64_t second = 0; second < 3600; second += 2) history.add(display, {.seconds = second});
  const auto series = history.series().front();
  for (auto _ : state)
    benchmark::DoNotOptimize(history.columns(series, history.last(std::chrono::minutes(10)), 60));
}
BENCHMARK(columnsOfTenMinutes);

}  // namespace
}  // namespace varnel
