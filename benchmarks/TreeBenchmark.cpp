#include <benchmark/benchmark.h>

#include "base/Dictionary.h"
#include "model/VarnelModelNode.h"

namespace varnel {
namespace {

Value displayOfLeaves(int sections, int leavesPerSection) {
  Value display = Value::ofDictionary();
  for (int section = 0; section < sections; ++section) {
    Value rows = Value::ofDictionary();
    for (int leaf = 0; leaf < leavesPerSection; ++leaf) {
      rows.dictionary()->set("Row number " + std::to_string(leaf), "-101.25 dBm");
    }
    display.dictionary()->set("Section " + std::to_string(section), rows);
  }
  return display;
}

void treeOf500Leaves(benchmark::State& state) {
  const Value display = displayOfLeaves(25, 20);
  for (auto _ : state) {
    PathDictionary paths;
    benchmark::DoNotOptimize(VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths));
  }
  state.SetItemsProcessed(state.iterations() * 500);
}
BENCHMARK(treeOf500Leaves);

}  // namespace
}  // namespace varnel
