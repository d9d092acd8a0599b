#include "programs/varnel-telephonyd/sources/PortCommands.h"

#include <gtest/gtest.h>

#include "tests/support/ScriptedModem.h"

namespace varnel {
namespace {

TEST(PortRequests, AreFramesByteForByte) {
  EXPECT_EQ(framed(portRequest::version()), (Bytes{0x00, 0x78, 0xF0, 0x7E}));
  EXPECT_EQ(framed(portRequest::build()), (Bytes{0x7C, 0x93, 0x49, 0x7E}));
  EXPECT_EQ(framed(portRequest::eventsOff()), (Bytes{0x60, 0x00, 0x12, 0x6A, 0x7E}));
  EXPECT_EQ(framed(portRequest::debugTextOff()),
            (Bytes{0x7D, 0x5D, 0x05, 0, 0, 0, 0, 0, 0, 0x74, 0x41, 0x7E}));
  EXPECT_EQ(framed(portRequest::allCodesOff()), (Bytes{0x73, 0, 0, 0, 0, 0, 0, 0, 0xDA, 0x81, 0x7E}));
  EXPECT_EQ(framed(portRequest::codeNumbers()), (Bytes{0x73, 0, 0, 0, 1, 0, 0, 0, 0x61, 0x9D, 0x7E}));
}

TEST(PortRequests, AMaskSaysWhatItIsAboutAndItsChecksumIsEscaped) {
  const CodeMask mask{.count = 17, .bits = {0x00, 0x04, 0x01}};
  EXPECT_EQ(framed(portRequest::setCodes(0xB, mask)),
            (Bytes{0x73, 0, 0, 0, 3,    0,    0,    0,    0x0B, 0,    0,   0,
                   17,   0, 0, 0, 0x00, 0x04, 0x01, 0x44, 0x7D, 0x5E, 0x7E}));
}

TEST(PortAnswers, BeginWithTheByteOfTheirRequest) {
  EXPECT_TRUE(isAnswer(Bytes{0x00, 'x'}, portRequest::version()));
  EXPECT_TRUE(isAnswer(Bytes{0x7C, 1}, portRequest::build()));
  EXPECT_TRUE(isAnswer(Bytes{0x60, 0}, portRequest::eventsOff()));
  EXPECT_TRUE(isAnswer(Bytes{0x7D, 5, 1, 0}, portRequest::debugTextOff()));
  EXPECT_FALSE(isAnswer(Bytes{0x7D, 1, 1, 0}, portRequest::debugTextOff()));
  EXPECT_FALSE(isAnswer(Bytes{0x92, 0, 0}, portRequest::version()));
  EXPECT_FALSE(isAnswer(Bytes{}, portRequest::version()));
}

TEST(PortAnswers, WhatOnlyRepeatsTheRequestForTheVersionIsNone) {
  EXPECT_FALSE(isAnswer(portRequest::version(), portRequest::version()));
}

TEST(PortAnswers, OfTheLogConfigurationAreOfTheSameOperationAndEquipment) {
  const Bytes ofNumbers{0x73, 0, 0, 0, 1, 0, 0, 0, 0, 0, 0, 0};
  const Bytes ofSetting{0x73, 0, 0, 0, 3, 0, 0, 0, 0, 0, 0, 0, 5, 0, 0, 0};
  EXPECT_TRUE(isAnswer(ofNumbers, portRequest::codeNumbers()));
  EXPECT_FALSE(isAnswer(ofNumbers, portRequest::allCodesOff()));
  EXPECT_TRUE(isAnswer(ofSetting, portRequest::setCodes(5, {})));
  EXPECT_FALSE(isAnswer(ofSetting, portRequest::setCodes(0xB, {})));
  EXPECT_FALSE(isAnswer(Bytes(ofNumbers.begin(), ofNumbers.end() - 1), portRequest::codeNumbers()));
}

TEST(PortAnswers, ErrorsAnswerTheRequestThatTheyRepeat) {
  const Bytes ofAllOff{0x14, 0x73, 0, 0, 0, 0, 0, 0, 0}, ofNumbers{0x14, 0x73, 0, 0, 0, 1, 0, 0, 0};
  EXPECT_FALSE(isAnswer(Bytes{0x13, 0x7C}, portRequest::allCodesOff()));
  EXPECT_FALSE(isAnswer(Bytes{0x13, 0x7C}, portRequest::codeNumbers()));
  EXPECT_TRUE(isAnswer(ofAllOff, portRequest::allCodesOff()));
  EXPECT_FALSE(isAnswer(ofAllOff, portRequest::codeNumbers()));
  EXPECT_TRUE(isAnswer(ofNumbers, portRequest::codeNumbers()));
  EXPECT_FALSE(isAnswer(ofNumbers, portRequest::allCodesOff()));
  EXPECT_TRUE(isAnswer(Bytes{0x14, 0x73, 0, 0}, portRequest::codeNumbers()));
  // More than the request, and nothing of it.
  EXPECT_TRUE(isAnswer(Bytes{0x13, 0x7C, 9, 9}, portRequest::build()));
  EXPECT_TRUE(isAnswer(Bytes{0x13}, portRequest::allCodesOff()));
}

TEST(PortAnswers, ErrorsRefuseTheirRequest) {
  for (std::uint8_t error = 0x13; error <= 0x18; ++error)
    EXPECT_TRUE(isAnswer(Bytes{error, 0x7C}, portRequest::build()));
  EXPECT_FALSE(isAnswer(Bytes{0x12}, portRequest::build()));
  EXPECT_FALSE(isAnswer(Bytes{0x19}, portRequest::build()));
  EXPECT_EQ(refusal(Bytes{0x14, 0x73}), "error 0x14");
}

TEST(PortAnswers, AStatusOtherThanZeroRefuses) {
  Bytes answer{0x73, 0, 0, 0, 3, 0, 0, 0, 0, 0, 0, 0};
  EXPECT_EQ(refusal(answer), std::nullopt);
  answer[8] = 2;
  EXPECT_EQ(refusal(answer), "status 2");
  EXPECT_EQ(refusal(Bytes{0x00, 1, 2, 3, 4, 5, 6, 7, 8, 9}), std::nullopt);
}

TEST(PortAnswers, TellHowManyCodesThereAreOfEachEquipmentAndNeverMoreThanItCanHave) {
  Bytes answer(12 + 64, 0);
  answer[0] = 0x73, answer[4] = 1;
  answer[12 + 4 * 0x4] = 0xD2, answer[13 + 4 * 0x4] = 0x04;
  answer[12 + 4 * 0xB] = 0x2B, answer[13 + 4 * 0xB] = 0x02;
  answer[15 + 4 * 0xD] = 0xFF;
  const auto numbers = codeNumbersIn(answer);
  ASSERT_TRUE(numbers);
  EXPECT_EQ((*numbers)[0x4], 1234u);
  EXPECT_EQ((*numbers)[0xB], 555u);
  EXPECT_EQ((*numbers)[0xD], 4096u);
  EXPECT_EQ((*numbers)[0xF], 0u);
  answer.pop_back();
  EXPECT_EQ(codeNumbersIn(answer), std::nullopt);
}

TEST(PortAnswers, TextsEndAtZeroAndHoldNothingUnprintable) {
  Bytes answer{0x7C, 1, 0, 0, 1, 0, 0, 0, 2, 0, 0, 0, ' ', 'A', 0x1B, '.', '2', ' ', 0, 'x'};
  EXPECT_EQ(buildIn(answer), "A.2");
  answer.resize(12);
  EXPECT_EQ(buildIn(answer), "");
  const std::string text = "Mar 14 202515:09:26Mar 15 2025";
  Bytes version{0x00};
  version.insert(version.end(), text.begin(), text.end());
  EXPECT_EQ(compilationIn(version), "Mar 14 2025 15:09:26");
  EXPECT_EQ(compilationIn(Bytes(19, 'x')), "");
}

}  // namespace
}  // namespace varnel
