#pragma once

#include "tests/support/DecoderHarness.h"

namespace varnel {

/// The tests of a section that no packet ever changes. The subject has the `Decoder`, its `sectionName`, its
/// `trace` line and the empty section that it gets from the template.
template <class Subject>
class CodelessSectionTest : public DecoderHarness<typename Subject::Decoder, 0> {
 protected:
  CodelessSectionTest() : DecoderHarness<typename Subject::Decoder, 0>(Subject::emptySection()) {}
};

TYPED_TEST_SUITE_P(CodelessSectionTest);

TYPED_TEST_P(CodelessSectionTest, HasItsSectionAndNoCode) {
  EXPECT_EQ(this->decoder.getSectionName(), TypeParam::sectionName);
  EXPECT_THAT(this->decoder.getLogCodeArray(), testing::IsEmpty());
}

TYPED_TEST_P(CodelessSectionTest, AnyPacketIsTracedOnlyAndChangesNothing) {
  this->expectIgnored({}, 0, {TypeParam::trace});
  this->expectIgnored(Bytes(300, 0xFF), 0x417A, {TypeParam::trace});
  this->expectIgnored(Bytes(300, 0x01), 0xFF0001, {TypeParam::trace});
  this->expectIgnored(Bytes(13, 0x01), 0xFFFFFFFF, {TypeParam::trace});
}

TYPED_TEST_P(CodelessSectionTest, WithoutASectionAnyPacketIsTracedOnlyAsWell) {
  EXPECT_THAT(this->linesWithoutSection(Bytes(300, 0xFF), 0x5137), testing::ElementsAre(TypeParam::trace));
}

REGISTER_TYPED_TEST_SUITE_P(CodelessSectionTest, HasItsSectionAndNoCode,
                            AnyPacketIsTracedOnlyAndChangesNothing,
                            WithoutASectionAnyPacketIsTracedOnlyAsWell);

}  // namespace varnel
