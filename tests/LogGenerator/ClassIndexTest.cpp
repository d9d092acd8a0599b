#include "LogGenerator/ClassIndex.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>

#include "tests/support/RecordingDecoder.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

struct Last {
  static constexpr std::string_view name = "Z Section";
  static inline const std::vector<std::uint32_t> logCodes = {0xD0E0, 0xFF0000, 0x51F8};
};
struct First {
  static constexpr std::string_view name = "A Section";
  static inline const std::vector<std::uint32_t> logCodes = {0x51F8, 0x0001, 0xD0E0};
};

class TestIndex final : public ClassIndex {
 public:
  using ClassIndex::ClassIndex;

  std::unique_ptr<RecordingDecoder<Last>> last = create<RecordingDecoder<Last>>();
  std::unique_ptr<RecordingDecoder<First>> first = create<RecordingDecoder<First>>();
};

class ClassIndexTest : public testing::Test {
 protected:
  RecordingLog log;
  std::ostringstream standardOutput;
};

TEST_F(ClassIndexTest, FindsADecoderByItsSectionName) {
  const TestIndex index(standardOutput);
  EXPECT_EQ(index.getClass("Z Section"), index.last.get());
  EXPECT_EQ(index.getClass("A Section"), index.first.get());
}

TEST_F(ClassIndexTest, ASectionThatNobodyOwnsHasNoDecoder) {
  const TestIndex index(standardOutput);
  EXPECT_EQ(index.getClass("a section"), nullptr);
  EXPECT_EQ(index.getClass("A Section "), nullptr);
  EXPECT_EQ(index.getClass(""), nullptr);
}

TEST_F(ClassIndexTest, SubscribersOfASharedCodeStandInTheOrderOfTheirCreation) {
  const TestIndex index(standardOutput);
  EXPECT_THAT(index.getSubscribers(0x51F8), ElementsAre(index.last.get(), index.first.get()));
  EXPECT_THAT(index.getSubscribers(0xD0E0), ElementsAre(index.last.get(), index.first.get()));
}

TEST_F(ClassIndexTest, ACodeOfOneDecoderHasThatSubscriberAlone) {
  const TestIndex index(standardOutput);
  EXPECT_THAT(index.getSubscribers(0x0001), ElementsAre(index.first.get()));
  EXPECT_THAT(index.getSubscribers(0xFF0000), ElementsAre(index.last.get()));
}

TEST_F(ClassIndexTest, ACodeThatNobodyWantsHasNoSubscribers) {
  const TestIndex index(standardOutput);
  EXPECT_THAT(index.getSubscribers(0x51F9), IsEmpty());
  EXPECT_THAT(index.getSubscribers(0x0000), IsEmpty());
  EXPECT_THAT(index.getSubscribers(0xFF0001), IsEmpty());
}

TEST_F(ClassIndexTest, AllLogCodesAreDecimalTextsInTheOrderOfTheirFirstRegistration) {
  const TestIndex index(standardOutput);
  EXPECT_THAT(index.getAllLogCodes(), ElementsAre("53472", "16711680", "20984", "1"));
}

TEST_F(ClassIndexTest, AnIndexWithoutDecodersHasNoLogCodes) {
  const ClassIndex index(standardOutput);
  EXPECT_THAT(index.getAllLogCodes(), IsEmpty());
  EXPECT_EQ(index.getClass("A Section"), nullptr);
}

TEST_F(ClassIndexTest, CreationLogsTheNumberOfLogCodesOfEachDecoder) {
  const TestIndex index(standardOutput);
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>Array Count: 3", "<4>Array Count: 3"));
}

TEST_F(ClassIndexTest, StatusTellsThatTheClassDictionaryIsADictionary) {
  const ClassIndex index(standardOutput);
  index.status();
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>Dictionary = 1", "<4>String = 0"));
}

TEST_F(ClassIndexTest, DestructionWritesItsLineToStandardOutputAndNoneToTheLog) {
  auto index = std::make_unique<ClassIndex>(standardOutput);
  EXPECT_EQ(standardOutput.str(), "");
  index.reset();
  EXPECT_EQ(standardOutput.str(), "Deallocing ClassIndex\n");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

}  // namespace
}  // namespace varnel
