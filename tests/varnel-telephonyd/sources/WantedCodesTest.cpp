#include "programs/varnel-telephonyd/sources/WantedCodes.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

CodeFilter modemCodes(CodeFilter::Codes codes) { return {.modemCodes = std::move(codes), .serverCodes = {}}; }

CodeNumbers numbersOf(std::size_t equipment, std::uint32_t number) {
  CodeNumbers numbers{};
  numbers[equipment] = number;
  return numbers;
}

TEST(WantedCodes, AMaskHasABitPerCodeAndGoesUpToTheHighestOne) {
  WantedCodes wanted;
  wanted.add(modemCodes({0xB00A, 0xB010}));
  const CodeMasks masks = wanted.masksFor(numbersOf(0xB, 0x400));
  EXPECT_EQ(masks[0xB], (CodeMask{.count = 17, .bits = {0x00, 0x04, 0x01}}));
  EXPECT_EQ(masks[0x5], CodeMask{});
  EXPECT_EQ(wanted.missingFrom(numbersOf(0xB, 0x400)), 0u);
}

TEST(WantedCodes, EachEquipmentHasAMaskOfItsOwn) {
  WantedCodes wanted;
  wanted.add(modemCodes({0x5007, 0xB000}));
  CodeNumbers numbers = numbersOf(0xB, 1);
  numbers[5] = 8;
  const CodeMasks masks = wanted.masksFor(numbers);
  EXPECT_EQ(masks[0x5], (CodeMask{.count = 8, .bits = {0x80}}));
  EXPECT_EQ(masks[0xB], (CodeMask{.count = 1, .bits = {0x01}}));
}

TEST(WantedCodes, CodesThatTheModemDoesNotHaveAreLeftOutAndCounted) {
  WantedCodes wanted;
  wanted.add(modemCodes({0xB00A, 0xB821, 0x512F, -1, 0x10000, 0xB0C5B0C5}));
  const CodeNumbers numbers = numbersOf(0xB, 0x821);
  EXPECT_EQ(wanted.masksFor(numbers)[0xB], (CodeMask{.count = 11, .bits = {0x00, 0x04}}));
  EXPECT_EQ(wanted.missingFrom(numbers), 5u);
  EXPECT_EQ(wanted.missingFrom(numbersOf(0xB, 0x822)), 4u);
}

TEST(WantedCodes, AreThoseOfAllViewersTogether) {
  WantedCodes wanted;
  EXPECT_TRUE(wanted.isEmpty());
  wanted.add(modemCodes({0xB000}));
  wanted.add(modemCodes({0xB000, 0xB001}));
  EXPECT_EQ(wanted.masksFor(numbersOf(0xB, 9))[0xB], (CodeMask{.count = 2, .bits = {0x03}}));
}

TEST(WantedCodes, AViewerThatNamesNoCodesWantsAll) {
  WantedCodes wanted;
  wanted.add({});
  EXPECT_FALSE(wanted.isEmpty());
  EXPECT_EQ(wanted.masksFor(numbersOf(0xB, 9))[0xB], (CodeMask{.count = 9, .bits = {0xFF, 0x01}}));
}

TEST(WantedCodes, CodesOfTheServersOwnMessagesAreNotTheModems) {
  WantedCodes wanted;
  wanted.add({.modemCodes = {}, .serverCodes = CodeFilter::Codes{1}});
  EXPECT_TRUE(wanted.isEmpty());
}

}  // namespace
}  // namespace varnel
