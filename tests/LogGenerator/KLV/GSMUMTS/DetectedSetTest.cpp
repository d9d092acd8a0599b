#include "LogGenerator/KLV/GSMUMTS/DetectedSet.h"

#include "tests/LogGenerator/KLV/GSMUMTS/PlaceholderSetTests.h"

namespace varnel {
namespace {

struct DetectedSetSubject {
  using Decoder = DetectedSet;
  static constexpr const char* trace = "<4>DetectedSet";
};

INSTANTIATE_TYPED_TEST_SUITE_P(DetectedSet, PlaceholderSetTest, DetectedSetSubject);

}  // namespace
}  // namespace varnel
