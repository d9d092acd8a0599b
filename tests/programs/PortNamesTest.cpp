#include "programs/varnel/PortNames.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>

#include "tests/support/Process.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

TEST(PortNames, AreThoseOfSerialLinesOfModemsInTheirOrder) {
  const TemporaryFolder devices;
  for (const char* name : {"ttyUSB1", "ttyUSB0", "ttyACM0", "wwan0at0", "tty1", "ttyS0", "null"})
    std::ofstream(devices.path() / name) << "";
  EXPECT_THAT(portNames(devices.path()), ElementsAre(devices.file("ttyACM0"), devices.file("ttyUSB0"),
                                                     devices.file("ttyUSB1"), devices.file("wwan0at0")));
}

TEST(PortNames, AreNoMoreThanAMenuCanHold) {
  const TemporaryFolder devices;
  for (int i = 0; i < 40; ++i) std::ofstream(devices.path() / ("ttyUSB" + std::to_string(i))) << "";
  EXPECT_THAT(portNames(devices.path()), SizeIs(16));
}

TEST(PortNames, OfAFolderThatIsNotThereAreNone) { EXPECT_THAT(portNames("/no such folder"), IsEmpty()); }

}  // namespace
}  // namespace varnel
