#include "LogGenerator/Base.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <future>

#include "LogGenerator/ArrayLock.h"
#include "LogGenerator/ClassIndex.h"
#include "tests/support/Describe.h"
#include "tests/support/RecordingDecoder.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

struct Cells {
  static constexpr std::string_view name = "Cells";
  static inline const std::vector<std::uint32_t> logCodes = {0x51F8, 0xFF0001, 0x51F8};
};
struct Idle {
  static constexpr std::string_view name = "Idle";
  static inline const std::vector<std::uint32_t> logCodes = {};
};

// Opens what is for decoders only.
class Decoder final : public RecordingDecoder<Cells> {
 public:
  using Base::updateLogCodeDict;
};

std::vector<Base*> subscribersOf(const CodeDictionary& codeDict, std::uint32_t code) {
  std::vector<Base*> decoders;
  for (const Subscriber& subscriber : codeDict.subscription(code)->subscribers)
    decoders.push_back(subscriber.decoder);
  return decoders;
}

TEST(Base, BeginsWithoutASection) {
  const Decoder decoder;
  EXPECT_TRUE(decoder.section().isAbsent());
}

TEST(Base, RegistersUnderItsSectionNameAndItsLogCodes) {
  Decoder decoder;
  ClassDictionary classDict;
  CodeDictionary codeDict;
  decoder.initWithDict_codeDict(classDict, codeDict);
  ASSERT_EQ(classDict.size(), 1u);
  EXPECT_EQ(classDict.at("Cells"), &decoder);
  EXPECT_THAT(codeDict.codes(), ElementsAre(0x51F8u, 0xFF0001u));
  EXPECT_THAT(subscribersOf(codeDict, 0xFF0001), ElementsAre(&decoder));
}

TEST(Base, TheLastOfTwoDecodersOfOneSectionOwnsIt) {
  Decoder first, last;
  ClassDictionary classDict;
  CodeDictionary codeDict;
  first.initWithDict_codeDict(classDict, codeDict);
  last.initWithDict_codeDict(classDict, codeDict);
  ASSERT_EQ(classDict.size(), 1u);
  EXPECT_EQ(classDict.at("Cells"), &last);
  EXPECT_THAT(subscribersOf(codeDict, 0xFF0001), ElementsAre(&first, &last));
}

TEST(Base, RegistrationLogsTheNumberOfLogCodes) {
  RecordingLog log;
  Decoder decoder;
  ClassDictionary classDict;
  CodeDictionary codeDict;
  decoder.initWithDict_codeDict(classDict, codeDict);
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>Array Count: 3"));
}

TEST(Base, ADecoderWithoutLogCodesLogsZeroAndSubscribesToNothing) {
  RecordingLog log;
  RecordingDecoder<Idle> decoder;
  ClassDictionary classDict;
  CodeDictionary codeDict;
  decoder.initWithDict_codeDict(classDict, codeDict);
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>Array Count: 0"));
  EXPECT_THAT(codeDict.codes(), IsEmpty());
  EXPECT_EQ(classDict.at("Idle"), &decoder);
}

TEST(Base, ACodeListedTwiceIsSubscribedTwice) {
  Decoder decoder;
  CodeDictionary codeDict;
  decoder.updateLogCodeDict(codeDict);
  EXPECT_THAT(subscribersOf(codeDict, 0x51F8), ElementsAre(&decoder, &decoder));
}

TEST(Base, TakingASectionLogsItsName) {
  RecordingLog log;
  Decoder decoder;
  decoder.updateSectionRef(Value::ofDictionary());
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>Cells"));
}

TEST(Base, TheSectionIsTheGivenContainerItself) {
  Decoder decoder;
  const Value entries = Value::ofDictionary();
  decoder.updateSectionRef(entries);
  EXPECT_EQ(decoder.section().dictionary(), entries.dictionary());
}

TEST(Base, ClearElementsInArrayRemovesThemAll) {
  Array array = {"1", Value::ofArray(), "3"};
  Decoder::clearElementsInArray(array);
  EXPECT_EQ(described(array), "[]");
  Decoder::clearElementsInArray(array);
  EXPECT_EQ(described(array), "[]");
}

TEST(Base, ReplaceArrayKeepsTheOrderOfTheNewElements) {
  Array array = {"old", "older"};
  Decoder::replaceArray_With(array, {"3", "1", "2"});
  EXPECT_EQ(described(array), R"(["3", "1", "2"])");
}

TEST(Base, ReplaceArrayWithNothingEmptiesIt) {
  Array array = {"old"};
  Decoder::replaceArray_With(array, {});
  EXPECT_EQ(described(array), "[]");
}

TEST(Base, ReplaceArrayTakesTheElementsThemselves) {
  const Value cell = Value::ofDictionary();
  Array array;
  Decoder::replaceArray_With(array, {cell});
  cell.dictionary()->set("ARFCN", "62");
  EXPECT_EQ(described(array), R"([{ARFCN: "62"}])");
}

// Runs the change on a thread of its own while this one holds the array lock.
template <class Change>
void expectToWaitForTheLock(const Change& change) {
  ArrayLock::lockArray();
  auto changing = std::async(std::launch::async, change);
  const auto status = changing.wait_for(100ms);
  ArrayLock::unlockArray();
  changing.get();
  EXPECT_EQ(status, std::future_status::timeout);
}

TEST(Base, ClearElementsInArrayHoldsTheArrayLock) {
  Array array = {"1"};
  expectToWaitForTheLock([&array] { Decoder::clearElementsInArray(array); });
  EXPECT_EQ(described(array), "[]");
}

TEST(Base, ReplaceArrayHoldsTheArrayLock) {
  Array array = {"1"};
  expectToWaitForTheLock([&array] { Decoder::replaceArray_With(array, {"2"}); });
  EXPECT_EQ(described(array), R"(["2"])");
}

struct Step {
  std::uint32_t energy;
  int decibels;
};

TEST(Base, LookUpECNOAtBothSidesOfEachStep) {
  constexpr Step steps[] = {
      {0, 0},       {1, 0},       {705, 0},     {706, -31},      {756, -31},      {757, -31},
      {813, -31},   {814, -30},   {949, -30},   {950, -29},      {1120, -29},     {1121, -28},
      {1336, -28},  {1337, -27},  {1607, -27},  {1608, -26},     {1949, -26},     {1950, -25},
      {2240, -25},  {2241, -24},  {2921, -24},  {2922, -23},     {3603, -23},     {3604, -22},
      {4461, -22},  {4462, -21},  {5542, -21},  {5543, -20},     {6902, -20},     {6903, -19},
      {8615, -19},  {8616, -18},  {10771, -18}, {10772, -17},    {13486, -17},    {13487, -16},
      {16903, -16}, {16904, -15}, {21205, -15}, {21206, -14},    {26621, -14},    {26622, -13},
      {33440, -13}, {33441, -12}, {42023, -12}, {42024, -11},    {52830, -11},    {52831, -10},
      {66435, -10}, {66436, -9},  {83562, -9},  {83563, -8},     {105123, -8},    {105124, -7},
      {132268, -7}, {132269, -6}, {166441, -6}, {166442, -5},    {209463, -5},    {209464, -4},
      {263624, -4}, {263625, -3}, {331808, -3}, {331809, -2},    {417647, -2},    {417648, -1},
      {524287, -1}, {524288, 0},  {524289, 0},  {0x7FFFFFFF, 0}, {0x80000000, 0}, {0xFFFFFFFF, 0},
  };
  for (const Step& step : steps) {
    EXPECT_EQ(Base::lookUpECNO(step.energy), step.decibels) << "energy " << step.energy;
  }
}

TEST(Base, LookUpECNOHasNoStepOfMinus32) {
  for (std::uint32_t energy = 0; energy < 1000; ++energy) {
    EXPECT_GE(Base::lookUpECNO(energy), -31) << "energy " << energy;
  }
}

}  // namespace
}  // namespace varnel
