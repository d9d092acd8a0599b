#include "LogGenerator/KLV/GSMUMTS/CellChangeCounters.h"

#include "tests/LogGenerator/KLV/GSMUMTS/CodelessSectionTests.h"

namespace varnel {
namespace {

struct CellChangeCountersSubject {
  using Decoder = CellChangeCounters;
  static constexpr const char* sectionName = "Cell Change Counters";
  static constexpr const char* trace = "<4>CellChangeCounters";
  static Value emptySection() { return Value::ofDictionary(); }
};

INSTANTIATE_TYPED_TEST_SUITE_P(CellChangeCounters, CodelessSectionTest, CellChangeCountersSubject);

}  // namespace
}  // namespace varnel
