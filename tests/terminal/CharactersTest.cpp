#include "terminal/Characters.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

TEST(Characters, ControlCharactersBecomeBlanks) {
  EXPECT_EQ(charactersOf("a\x1b[31mb\nc\td\x7f"), L"a [31mb c d ");
  EXPECT_EQ(charactersOf("a\xC2\x9B"
                         "b"),
            L"a b")
      << "C1";
}

TEST(Characters, CharactersThatTurnTheDirectionBecomeBlanks) {
  EXPECT_EQ(charactersOf("a\xE2\x80\xAE"
                         "b"),
            L"a b");
}

TEST(Characters, BytesThatAreNotUtf8BecomeReplacementCharacters) {
  EXPECT_EQ(charactersOf("a\xFF"
                         "b"),
            L"a\xFFFD"
            L"b");
  EXPECT_EQ(charactersOf("\xC3"), L"\xFFFD") << "cut";
  EXPECT_EQ(charactersOf("\xC0\x80"), L"\xFFFD\xFFFD") << "longer than needed";
  EXPECT_EQ(charactersOf("\xED\xA0\x80"), L"\xFFFD\xFFFD\xFFFD") << "half of a pair";
}

TEST(Characters, Utf8GoesThereAndBack) {
  EXPECT_EQ(charactersOf("é中😀"), L"é中\x1F600");
  EXPECT_EQ(utf8(L"é中\x1F600"), "é中😀");
}

TEST(Characters, AWideCharacterTakesTwoColumns) {
  EXPECT_EQ(columnsOf("abc"), 3);
  EXPECT_EQ(columnsOf("中国"), 4);
  EXPECT_EQ(columnsOf("e\xCC\x81"), 1) << "an accent takes none";
}

TEST(Characters, HalfOfAWideCharacterDoesNotFit) {
  EXPECT_EQ(fitting(L"中国", 3), L"中");
  EXPECT_EQ(fitting(L"abc", 0), L"");
}

TEST(Characters, ACutTextEndsInTheMark) {
  EXPECT_EQ(cutTo(L"abcdef", 6, L"…"), L"abcdef");
  EXPECT_EQ(cutTo(L"abcdef", 4, L"…"), L"abc…");
  EXPECT_EQ(cutTo(L"abcdef", 0, L"…"), L"");
}

TEST(Characters, LinesAreBrokenAtBlanks) {
  EXPECT_THAT(wrapped("one two three", 8), ElementsAre(L"one two", L"three"));
  EXPECT_THAT(wrapped("abcdefgh", 3), ElementsAre(L"abc", L"def", L"gh"));
  EXPECT_THAT(wrapped("a\n\nb", 3), ElementsAre(L"a", L"", L"b"));
  EXPECT_THAT(wrapped("中国", 1), ElementsAre(L"中", L"国")) << "what never fits ends nevertheless";
  EXPECT_THAT(wrapped("abc", 0), IsEmpty());
}

}  // namespace
}  // namespace varnel
