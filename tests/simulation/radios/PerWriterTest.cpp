#include "programs/varnel-telephonyd/simulation/radios/PerWriter.h"

#include <gtest/gtest.h>

namespace varnel::simulation {
namespace {

TEST(PerWriter, TheFirstBitIsTheHighestOfTheFirstByte) {
  EXPECT_EQ(PerWriter().bits(1, 1).bits(3, 2).finish(), (Bytes{0xA0}));
}

TEST(PerWriter, NumbersGoOnInTheNextByte) {
  EXPECT_EQ(PerWriter().bits(4, 0x5).bits(8, 0xC3).bits(12, 0xF0F).finish(), (Bytes{0x5C, 0x3F, 0x0F}));
}

TEST(PerWriter, AnOctetStringHasItsLengthBeforeItAndBeginsAtAnyBit) {
  EXPECT_EQ(PerWriter().absent(4).octetString(Bytes{0xAB}).finish(), (Bytes{0x00, 0x1A, 0xB0}));
}

}  // namespace
}  // namespace varnel::simulation
