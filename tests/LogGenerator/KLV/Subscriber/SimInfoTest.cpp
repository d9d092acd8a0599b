#include "LogGenerator/KLV/Subscriber/SimInfo.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t simCode = 0xFF0000;
constexpr const char* trace = "<4>SimInfo";
constexpr const char* failure = "<3>SIM File dictionary data could not be constructed";

class SimInfoTest : public testing::Test {
 protected:
  SimInfoTest() {
    decoder.updateSectionRef(section);
    log.take();
  }

  void decode(const Bytes& bytes, std::uint32_t logCode = simCode) {
    decoder.updateWithData_logCode(Packet(bytes), logCode);
  }
  void decodeFiles(std::initializer_list<Dictionary::Entry> files) {
    decode(serverMessage(simCode, dictionaryOf(files)));
  }
  void expectToBeUnreadable(const Bytes& message) {
    section.dictionary()->set("EF-LOCI", "old");
    EXPECT_THROW(decode(message), LogCode_0xFF0000::UnknownDataException) << message.size() << " bytes";
    EXPECT_THAT(log.takeTexts(), ElementsAre(trace, failure)) << message.size() << " bytes";
    EXPECT_EQ(shown(), R"({EF-LOCI: "old"})") << message.size() << " bytes";
  }
  std::string shown() const { return described(section); }

  RecordingLog log;
  SimInfo decoder;
  Value section = Value::ofDictionary();
};

TEST_F(SimInfoTest, EachFileHasItsEntryInTheOrderOfTheTableWhateverThatOfThePayload) {
  decodeFiles({{"kSimFile_OPLMNAcT", "14"},
               {"kSimFile_OPL", "13"},
               {"kSimFile_PNN", "12"},
               {"kSimFile_RATMODE", "11"},
               {"kSimFile_AHPLMN", "10"},
               {"kSimFile_FPLMN", "9"},
               {"kSimFile_AD", "8"},
               {"kSimFile_ACC", "7"},
               {"kSimFile_PSLOCI", "6"},
               {"kSimFile_LOCI", "5"},
               {"kSimFile_HPPLMN", "4"},
               {"kSimFile_MBDN", "3"},
               {"kSimFile_MSISDN", "2"},
               {"kSimFile_ICCID", "1"}});
  EXPECT_EQ(shown(), R"({EF-ICCID: "1", EF-MSISDN: "2", EF-3GPP MAIL BOX DIALING NUMBER: "3", )"
                     R"(EF-HPPLMN SEARCH PERIOD: "4", EF-LOCI: "5", EF-GPRS/PS-LOCI: "6", )"
                     R"(EF-ACCESS CONTROL CLASS: "7", EF-ADMINISTRATIVE DATA: "8", EF-FPLMN: "9", )"
                     R"(EF-ACTING HPLMN: "10", EF-RAT MODE: "11", EF-PLMN NETWORK NAME: "12", )"
                     R"(EF-OPERATOR PLMN LIST: "13", EF-OPLMNAcT: "14"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(SimInfoTest, ALaterPayloadReplacesItsEntriesAndKeepsTheOthers) {
  decodeFiles({{"kSimFile_ICCID", "8949"}, {"kSimFile_LOCI", "262-01"}});
  decodeFiles({{"kSimFile_ICCID", "8950"}});
  EXPECT_EQ(shown(), R"({EF-ICCID: "8950", EF-LOCI: "262-01"})");
  decodeFiles({{"kSimFile_ACC", "0x0200"}});
  EXPECT_EQ(shown(), R"({EF-ICCID: "8950", EF-LOCI: "262-01", EF-ACCESS CONTROL CLASS: "0x0200"})");
}

TEST_F(SimInfoTest, EntriesOfTheTemplateKeepTheirPlaces) {
  section.dictionary()->set("EF-LOCI", "");
  section.dictionary()->set("EF-ICCID", "");
  decodeFiles({{"kSimFile_ICCID", "8949"}, {"kSimFile_LOCI", "262-01"}});
  EXPECT_EQ(shown(), R"({EF-LOCI: "262-01", EF-ICCID: "8949"})");
}

TEST_F(SimInfoTest, KeysThatAreNotInTheTableAreIgnored) {
  decodeFiles({{"EF-ICCID", "1"}, {"kSimFile_IMSI", "2"}, {"ksimfile_iccid", "3"}, {"kSimFile_AD", "4"}});
  EXPECT_EQ(shown(), R"({EF-ADMINISTRATIVE DATA: "4"})");
}

TEST_F(SimInfoTest, ValuesOfAnyKindAreCopiedUnchanged) {
  decodeFiles({{"kSimFile_ICCID", Value::ofInteger(-5)},
               {"kSimFile_MSISDN", Value::ofArray({"a", Value::ofBoolean(false)})},
               {"kSimFile_MBDN", dictionaryOf({{"Number", "3311"}})},
               {"kSimFile_HPPLMN", Value::ofData({0x01, 0xFF})},
               {"kSimFile_LOCI", Value::ofReal(2.5)},
               {"kSimFile_PSLOCI", ""}});
  EXPECT_EQ(shown(), R"({EF-ICCID: -5, EF-MSISDN: ["a", false], )"
                     R"(EF-3GPP MAIL BOX DIALING NUMBER: {Number: "3311"}, EF-HPPLMN SEARCH PERIOD: <01ff>, )"
                     R"(EF-LOCI: 2.50000, EF-GPRS/PS-LOCI: ""})");
}

TEST_F(SimInfoTest, ReadsXmlAsWell) {
  decode(serverMessageOfText(simCode,
                             "<plist version=\"1.0\"><dict><key>kSimFile_FPLMN</key>"
                             "<string>262-02</string></dict></plist>"));
  EXPECT_EQ(shown(), R"({EF-FPLMN: "262-02"})");
}

TEST_F(SimInfoTest, AnEmptyDictionaryChangesNothing) {
  section.dictionary()->set("EF-LOCI", "old");
  decodeFiles({});
  EXPECT_EQ(shown(), R"({EF-LOCI: "old"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(SimInfoTest, APayloadThatIsNoPropertyListIsReportedAndThrows) {
  expectToBeUnreadable(serverMessageOfText(simCode, "no property list"));
}

TEST_F(SimInfoTest, APayloadThatIsNoDictionaryCannotBeReadEither) {
  expectToBeUnreadable(serverMessage(simCode, Value::ofArray({"kSimFile_ICCID", "8949"})));
  expectToBeUnreadable(serverMessage(simCode, "kSimFile_ICCID"));
  expectToBeUnreadable(serverMessage(simCode, Value::ofInteger(1)));
}

TEST_F(SimInfoTest, AMessageOf13BytesHasAnEmptyPayloadAndThrows) { expectToBeUnreadable(Bytes(13)); }

TEST_F(SimInfoTest, EveryTruncatedMessageIsReportedAndThrows) {
  Bytes message = serverMessage(
      simCode, dictionaryOf({{"kSimFile_ICCID", "8949"}, {"kSimFile_AD", "Administrative data of 3 bytes"}}));
  while (!message.empty()) {
    message.pop_back();
    expectToBeUnreadable(message);
  }
}

TEST_F(SimInfoTest, WithoutASectionEverythingRunsAndLogsAsUsual) {
  SimInfo sectionless;
  const Bytes message = serverMessage(simCode, dictionaryOf({{"kSimFile_ICCID", "8949"}}));
  sectionless.updateWithData_logCode(Packet(message), simCode);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
  EXPECT_THROW(sectionless.updateWithData_logCode(Packet(Bytes(13)), simCode),
               LogCode_0xFF0000::UnknownDataException);
}

}  // namespace
}  // namespace varnel
