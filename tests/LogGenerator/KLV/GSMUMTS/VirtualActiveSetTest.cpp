#include "LogGenerator/KLV/GSMUMTS/VirtualActiveSet.h"

#include "tests/LogGenerator/KLV/GSMUMTS/PlaceholderSetTests.h"

namespace varnel {
namespace {

struct VirtualActiveSetSubject {
  using Decoder = VirtualActiveSet;
  static constexpr const char* trace = "<4>VirtualActiveSet";
};

INSTANTIATE_TYPED_TEST_SUITE_P(VirtualActiveSet, PlaceholderSetTest, VirtualActiveSetSubject);

}  // namespace
}  // namespace varnel
