#include "LogGenerator/Radios/SubscriberFiles.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using testing::Contains;

constexpr std::uint32_t simCode = 0xFF0000;

std::string shownBy(SubscriberFiles& decoder, const Bytes& message) {
  const Value section = Value::ofDictionary();
  decoder.updateSectionRef(section);
  decoder.updateWithData_logCode(Packet(message), simCode);
  return described(section);
}

Bytes filesOfAPerson() {
  return serverMessage(simCode, dictionaryOf({{"kSimFile_ICCID", "8900"},
                                              {"kSimFile_MSISDN", "+1555"},
                                              {"kSimFile_LOCI", "TMSI 1"},
                                              {"kSimFile_PSLOCI", "P-TMSI 2"},
                                              {"kSimFile_RATMODE", "LTE"}}));
}

TEST(SubscriberFiles, FilesThatNameAPersonAreOnlySaidToBePresent) {
  SubscriberFiles decoder;
  EXPECT_EQ(shownBy(decoder, filesOfAPerson()),
            R"({EF-ICCID: "present", EF-MSISDN: "present", EF-LOCI: "present", )"
            R"(EF-GPRS/PS-LOCI: "present", EF-RAT MODE: "LTE"})");
}

TEST(SubscriberFiles, FilesThatNameAPersonAreShownWhenAskedFor) {
  SubscriberFiles decoder(Identities::Shown);
  EXPECT_EQ(shownBy(decoder, filesOfAPerson()),
            R"({EF-ICCID: "8900", EF-MSISDN: "+1555", EF-LOCI: "TMSI 1", )"
            R"(EF-GPRS/PS-LOCI: "P-TMSI 2", EF-RAT MODE: "LTE"})");
}

TEST(SubscriberFiles, WhatIsNotThereIsNotPresent) {
  SubscriberFiles decoder;
  EXPECT_EQ(shownBy(decoder, serverMessage(simCode, dictionaryOf({{"kSimFile_ICCID", ""}}))),
            R"({EF-ICCID: ""})");
}

TEST(SubscriberFiles, AFileOfAnotherKindIsHiddenToo) {
  SubscriberFiles decoder;
  const Value files = dictionaryOf(
      {{"kSimFile_ICCID", Value::ofData({1, 2})}, {"kSimFile_MSISDN", Value::ofArray({"+1555"})}});
  EXPECT_EQ(shownBy(decoder, serverMessage(simCode, files)),
            R"({EF-ICCID: "present", EF-MSISDN: "present"})");
}

TEST(SubscriberFiles, WhatCannotBeReadIsDroppedWithALine) {
  RecordingLog log;
  SubscriberFiles decoder;
  for (const Bytes& message : {serverMessageOfText(simCode, "no list"), serverMessageOfText(simCode, ""),
                               serverMessage(simCode, Value::ofArray())}) {
    EXPECT_EQ(shownBy(decoder, message), "{}");
    EXPECT_THAT(log.takeTexts(), Contains("<3>SIM File dictionary data could not be constructed"));
  }
}

}  // namespace
}  // namespace varnel
