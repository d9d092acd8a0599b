#include "LogGenerator/CodeSections.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <map>
#include <memory>
#include <set>
#include <sstream>

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/LogGenerator.h"
#include "platform/TelephonyService.h"
#include "tests/support/C2KHarness.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/RecordingDecoder.h"
#include "tests/support/SimulatedMessages.h"
#include "tests/support/TestServices.h"

namespace varnel {

void PrintTo(const CodeSections& entry, std::ostream* stream) {
  *stream << std::hex << entry.logCode;
  for (const std::string& section : entry.sections) *stream << ", " << section;
}

namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;

struct Twice {
  static constexpr std::string_view name = "Twice";
  static inline const std::vector<std::uint32_t> logCodes = {0x5000, 0x4000, 0x5000};
};
struct Once {
  static constexpr std::string_view name = "Once";
  static inline const std::vector<std::uint32_t> logCodes = {0x5000};
};

class TwoSections final : public ClassIndex {
 public:
  using ClassIndex::ClassIndex;

  std::unique_ptr<RecordingDecoder<Twice>> twice = create<RecordingDecoder<Twice>>();
  std::unique_ptr<RecordingDecoder<Once>> once = create<RecordingDecoder<Once>>();
};

TEST(CodeSections, OfAnIndexStandInTheOrderOfSubscriptionEachSectionOnce) {
  std::ostringstream standardOutput;
  const TwoSections index(standardOutput);
  EXPECT_THAT(index.codeSections(),
              ElementsAre(CodeSections{0x5000, {"Twice", "Once"}}, CodeSections{0x4000, {"Twice"}}));
}

std::vector<CodeSections> sectionsOf(std::string_view technology, const TestServices& host) {
  return LogGenerator::generatorFromTechnology(technology, host.services)->codeSections();
}

TEST(CodeSections, OfATemplateDrivenGeneratorAreThoseOfItsDecoders) {
  const TestServices host;
  EXPECT_THAT(sectionsOf(technology::kalviLTE, host),
              Contains(CodeSections{0xB180, {"Neighbor Measurements", "Neighbor Cells List"}}));
}

TEST(CodeSections, ThereAreNoneWithoutPackets) {
  const TestServices host;
  EXPECT_THAT(sectionsOf(technology::ifxGSM, host), IsEmpty());
}

TEST(CodeSections, ThereAreNoneWithoutDecoders) {
  const TestServices host;  // no template for UTRAN
  EXPECT_THAT(sectionsOf(technology::kalviUTRAN2, host), IsEmpty());
}

TEST(CodeSections, OfCDMA2000AreTheOnesOfTheTemplateThatShowAVariableOfThePacket) {
  TestServices host;
  host.resources.add(
      "C2KTemplate",
      dictionaryOf({{"_sorted", "_sorted"},
                    {"2;Fingers", dictionaryOf({{"1;Inner", dictionaryOf({{"C2I", "kFingerC2I"}})}})},
                    {"1;System", dictionaryOf({{"System ID", "kSystemId"}, {"C2I", "kFingerC2I"}})}}));
  EXPECT_THAT(
      sectionsOf(technology::kalviCDMA, host),
      ElementsAre(CodeSections{0x108A, {"Fingers", "System"}}, CodeSections{0x1183, {}},
                  CodeSections{0x1192, {}}, CodeSections{0x12B6, {}}, CodeSections{0x119C, {}},
                  CodeSections{0x119D, {}}, CodeSections{0x127E, {}}, CodeSections{0x134F, {"System"}}));
}

// A generator whose template shows each variable in a section of its own name.
class PublishedVariables : public C2KTest {
 protected:
  PublishedVariables() {
    const Value sections = Value::ofDictionary();
    for (const char* variable : c2kVariables)
      sections.dictionary()->set(variable, dictionaryOf({{"row", variable}}));
    host.resources.add("C2KTemplate", sections);
  }
};

TEST_F(PublishedVariables, OfEachCodeAreExactlyThoseThatItsPacketsOfAWalkPublish) {
  std::map<unsigned, std::set<std::string>> seen, said;
  for (const SimulatedPacket& message :
       simulatedMessages(technology::kalviCDMA, 1, std::chrono::minutes(10))) {
    published(message.packet);
    for (const auto& [variable, value] : *display.dictionary()) seen[message.code()].insert(variable);
  }
  for (const auto& [logCode, sections] : generator.codeSections())
    said[logCode] = std::set<std::string>(sections.begin(), sections.end());
  EXPECT_EQ(seen, said);
}

}  // namespace
}  // namespace varnel
