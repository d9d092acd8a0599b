#include "host/captures/ModemTime.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

TEST(ModemTime, Counts1And1Quarter_msFrom1980AndPartsOfThat) {
  EXPECT_EQ(timeOf({0}), (Time{315964800, 0}));  // 1980-01-06 00:00:00
  // 800 units are a second.
  EXPECT_EQ(timeOf({std::uint64_t{800} << 16}), (Time{315964801, 0}));
  // 24,576 of 49,152 parts are 0.625 ms.
  EXPECT_EQ(timeOf({0x0103877DA3306000}), (Time{1709301909, 500625000}));
}

TEST(ModemTime, PartsAreRoundedToNanoseconds) {
  EXPECT_EQ(timeOf({1}).nanoseconds, 25);           // 25.4
  EXPECT_EQ(timeOf({2}).nanoseconds, 51);           // 50.9
  EXPECT_EQ(timeOf({49151}).nanoseconds, 1249975);  // 1,249,974.6
}

TEST(ModemTime, MorePartsThanAUnitHasAreCarried) {
  // 799 units and 65,535 parts: 998.75 ms and 1.666641 ms.
  EXPECT_EQ(timeOf({std::uint64_t{799} << 16 | 0xFFFF}), (Time{315964801, 416641}));
}

TEST(ModemTime, Before1990TheDateIsUnknown) {
  EXPECT_EQ(datingOf({0x003AB54BFFFFFFFF}), Dating::Unknown);
  EXPECT_EQ(datingOf({0x003AB54C00000000}), Dating::Known);
  EXPECT_EQ(timeOf({0x003AB54C00000000}), (Time{631152000, 0}));  // 1990-01-01 00:00:00
}

TEST(ModemTime, OfAMomentIsTheNearest) {
  EXPECT_EQ(modemTimeOf({1709301909, 500625000}).raw, 0x0103877DA3306000u);
  EXPECT_EQ(modemTimeOf({1709301909, 500625012}).raw, 0x0103877DA3306000u);
  EXPECT_EQ(modemTimeOf({1709301909, 500625013}).raw, 0x0103877DA3306001u);
  // A time less than half a part before the next unit becomes that unit.
  EXPECT_EQ(modemTimeOf({315964800, 1249999}).raw, 0x10000u);
}

TEST(ModemTime, EveryPartComesBack) {
  for (std::uint64_t parts = 0; parts < 49152; ++parts) {
    const std::uint64_t raw = 0x0103877DA3300000 | parts;
    ASSERT_EQ(modemTimeOf(timeOf({raw})).raw, raw);
  }
}

TEST(ModemTime, MomentsThatItCannotHoldBecomeItsFirstAndLast) {
  EXPECT_EQ(modemTimeOf({0, 0}).raw, 0u);
  EXPECT_EQ(modemTimeOf({-1, 5}).raw, 0u);
  EXPECT_EQ(modemTimeOf({INT64_MAX, 999999999}).raw, 0xFFFFFFFFFFFF0000u);
}

}  // namespace
}  // namespace varnel
