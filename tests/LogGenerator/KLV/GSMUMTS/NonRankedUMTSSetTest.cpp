#include "LogGenerator/KLV/GSMUMTS/NonRankedUMTSSet.h"

#include "tests/LogGenerator/KLV/GSMUMTS/CodelessSectionTests.h"

namespace varnel {
namespace {

struct NonRankedUMTSSetSubject {
  using Decoder = NonRankedUMTSSet;
  static constexpr const char* sectionName = "Non-Ranked UMTS Set";
  static constexpr const char* trace = "<4>NonRankedUMTSSet";
  static Value emptySection() { return Value::ofArray(); }
};

INSTANTIATE_TYPED_TEST_SUITE_P(NonRankedUMTSSet, CodelessSectionTest, NonRankedUMTSSetSubject);

}  // namespace
}  // namespace varnel
