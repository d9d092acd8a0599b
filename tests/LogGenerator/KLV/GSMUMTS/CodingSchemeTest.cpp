#include "LogGenerator/KLV/GSMUMTS/CodingScheme.h"

#include "tests/LogGenerator/KLV/GSMUMTS/CodelessSectionTests.h"

namespace varnel {
namespace {

struct CodingSchemeSubject {
  using Decoder = CodingScheme;
  static constexpr const char* sectionName = "Coding Scheme";
  // The text of its sibling.
  static constexpr const char* trace = "<4>CellChangeCounters";
  static Value emptySection() { return Value::ofDictionary(); }
};

INSTANTIATE_TYPED_TEST_SUITE_P(CodingScheme, CodelessSectionTest, CodingSchemeSubject);

}  // namespace
}  // namespace varnel
