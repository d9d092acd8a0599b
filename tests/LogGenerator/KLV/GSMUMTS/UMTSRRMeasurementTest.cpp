#include "LogGenerator/KLV/GSMUMTS/UMTSRRMeasurement.h"

#include "tests/LogGenerator/KLV/GSMUMTS/CodelessSectionTests.h"

namespace varnel {
namespace {

struct UMTSRRMeasurementSubject {
  using Decoder = UMTSRRMeasurement;
  static constexpr const char* sectionName = "UMTS RR Measurement";
  static constexpr const char* trace = "<4>UMTSRRMeasurement";
  static Value emptySection() { return Value::ofDictionary(); }
};

INSTANTIATE_TYPED_TEST_SUITE_P(UMTSRRMeasurement, CodelessSectionTest, UMTSRRMeasurementSubject);

}  // namespace
}  // namespace varnel
