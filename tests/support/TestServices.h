#pragma once

#include <sstream>
#include <string>

#include "LogGenerator/Services.h"
#include "tests/support/FakeClock.h"
#include "tests/support/FakeResources.h"

namespace varnel {

/// The services of a generator, all under the control of a test. Standard output is a text.
struct TestServices {
  TestServices() = default;
  TestServices(const TestServices&) = delete;
  TestServices& operator=(const TestServices&) = delete;

  FakeResources resources;
  FakeClock clock;
  ApplicationInfo application{"2.0", "Nov  2 2022 18:26:06"};
  std::ostringstream standardOutput;
  const Services services{resources, clock, application, standardOutput};
};

}  // namespace varnel
