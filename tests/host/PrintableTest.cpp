#include "host/Printable.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

TEST(Printable, ControlCharactersAreFourHexadecimalDigits) {
  EXPECT_EQ(printable("a\x1b[31mb"), "a\\u001B[31mb");
  EXPECT_EQ(printable("\x7f"), "\\u007F");
  EXPECT_EQ(printable("\xc2\x9b"), "\\u009B") << "the eight-bit form of the escape sequence's beginning";
  EXPECT_EQ(printable("line\n"), "line\\u000A");
}

TEST(Printable, OtherCharactersStayAsTheyAre) {
  EXPECT_EQ(printable("Größe 12 µs – 日本"), "Größe 12 µs – 日本");
  EXPECT_EQ(printable("a\tb\x01", "\t"), "a\tb\\u0001");
}

}  // namespace
}  // namespace varnel
