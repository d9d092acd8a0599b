#include "LogGenerator/KLV/GSMUMTS/MonitoredSet.h"

#include "tests/LogGenerator/KLV/GSMUMTS/PlaceholderSetTests.h"

namespace varnel {
namespace {

struct MonitoredSetSubject {
  using Decoder = MonitoredSet;
  static constexpr const char* trace = "<4>MonitoredSet";
};

INSTANTIATE_TYPED_TEST_SUITE_P(MonitoredSet, PlaceholderSetTest, MonitoredSetSubject);

}  // namespace
}  // namespace varnel
