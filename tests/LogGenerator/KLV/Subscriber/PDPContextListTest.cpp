#include "LogGenerator/KLV/Subscriber/PDPContextList.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <future>

#include "LogGenerator/ArrayLock.h"
#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;

constexpr std::uint32_t pdpCode = 0xFF0002;
constexpr const char* trace = "<4>PDPContextList";

class PDPContextListTest : public testing::Test {
 protected:
  PDPContextListTest() {
    decoder.updateSectionRef(section);
    log.take();
  }

  void decode(const Bytes& bytes, std::uint32_t logCode = pdpCode) {
    decoder.updateWithData_logCode(Packet(bytes), logCode);
  }
  void expectToBeIgnored(const Bytes& message) {
    decode(message);
    EXPECT_EQ(shown(), R"(["old"])") << message.size() << " bytes";
    EXPECT_THAT(log.takeTexts(), ElementsAre(trace)) << message.size() << " bytes";
  }
  std::string shown() const { return described(section); }

  RecordingLog log;
  PDPContextList decoder;
  Value section = Value::ofArray({"old"});
};

TEST_F(PDPContextListTest, ShowsExactlyTheLastArrayReceived) {
  decode(serverMessage(pdpCode, Value::ofArray({dictionaryOf({{"APN", "internet"}, {"Address", "10.0.0.1"}}),
                                                dictionaryOf({{"APN", "ims"}})})));
  EXPECT_EQ(shown(), R"([{APN: "internet", Address: "10.0.0.1"}, {APN: "ims"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
  decode(serverMessage(pdpCode, Value::ofArray({dictionaryOf({{"APN", "ims"}})})));
  EXPECT_EQ(shown(), R"([{APN: "ims"}])");
}

TEST_F(PDPContextListTest, AnEmptyArrayEmptiesTheSection) {
  decode(serverMessage(pdpCode, Value::ofArray()));
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(PDPContextListTest, ElementsOfAnyKindAreShownAsReceived) {
  decode(serverMessage(
      pdpCode, Value::ofArray({"text", Value::ofInteger(2), Value::ofData({0xAB}), Value::ofArray({"1"})})));
  EXPECT_EQ(shown(), R"(["text", 2, <ab>, ["1"]])");
}

TEST_F(PDPContextListTest, ReadsXmlAsWell) {
  decode(serverMessageOfText(pdpCode, "<plist version=\"1.0\"><array><string>new</string></array></plist>"));
  EXPECT_EQ(shown(), R"(["new"])");
}

TEST_F(PDPContextListTest, TheCodeIsNotLookedAt) {
  decode(serverMessage(pdpCode, Value::ofArray({"new"})), 0x1234);
  EXPECT_EQ(shown(), R"(["new"])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(PDPContextListTest, APayloadThatIsNoArrayIsIgnored) {
  expectToBeIgnored(serverMessage(pdpCode, dictionaryOf({{"APN", "internet"}})));
  expectToBeIgnored(serverMessage(pdpCode, "text"));
  expectToBeIgnored(serverMessage(pdpCode, Value::ofInteger(1)));
}

TEST_F(PDPContextListTest, APayloadThatIsNoPropertyListIsIgnored) {
  expectToBeIgnored(serverMessageOfText(pdpCode, "no property list"));
}

TEST_F(PDPContextListTest, AMessageOf13BytesHasAnEmptyPayloadAndIsIgnored) { expectToBeIgnored(Bytes(13)); }

TEST_F(PDPContextListTest, EveryTruncatedMessageIsIgnored) {
  Bytes message = serverMessage(pdpCode, Value::ofArray({dictionaryOf({{"APN", "a name of some length"}})}));
  while (!message.empty()) {
    message.pop_back();
    expectToBeIgnored(message);
  }
}

TEST_F(PDPContextListTest, TheReplacementHoldsTheArrayLock) {
  const Bytes message = serverMessage(pdpCode, Value::ofArray({"new"}));
  ArrayLock::lockArray();
  auto decoding = std::async(std::launch::async, [&] { decode(message); });
  const auto status = decoding.wait_for(100ms);
  const std::string whileHeld = shown();
  ArrayLock::unlockArray();
  decoding.get();
  EXPECT_EQ(status, std::future_status::timeout);
  EXPECT_EQ(whileHeld, R"(["old"])");
  EXPECT_EQ(shown(), R"(["new"])");
}

}  // namespace
}  // namespace varnel
