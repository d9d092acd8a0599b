#include "LogGenerator/KLV/GSMUMTS/NonRankedGSMSet.h"

#include "tests/LogGenerator/KLV/GSMUMTS/CodelessSectionTests.h"

namespace varnel {
namespace {

struct NonRankedGSMSetSubject {
  using Decoder = NonRankedGSMSet;
  static constexpr const char* sectionName = "Non-Ranked GSM Set";
  static constexpr const char* trace = "<4>NonRankedGSMSet";
  static Value emptySection() { return Value::ofArray(); }
};

INSTANTIATE_TYPED_TEST_SUITE_P(NonRankedGSMSet, CodelessSectionTest, NonRankedGSMSetSubject);

}  // namespace
}  // namespace varnel
