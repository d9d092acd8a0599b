#include "LogGenerator/Field.h"

#include <gtest/gtest.h>

#include <limits>

#include "tests/support/Describe.h"

namespace varnel {
namespace {

// What a table shows of these bytes in an empty section.
std::string shown(const Bytes& bytes, std::span<const Field> fields) {
  Dictionary section;
  setFields(section, Packet(bytes), fields);
  return described(section);
}

TEST(Field, ShowsIntegersOfEachWidthAsDecimals) {
  static constexpr Field fields[] = {{u8(0), "8"}, {u16(1), "16"}, {u32(3), "32"}, {s16(7), "Signed"}};
  EXPECT_EQ(shown({0xFF, 0xFE, 0xFF, 0x01, 0x00, 0x00, 0x7F, 0xFE, 0xFF}, fields),
            R"({8: "255", 16: "65534", 32: "2130706433", Signed: "-2"})");
}

TEST(Field, ShowsANumberOf32BitsAsASignedOne) {
  static constexpr Field fields[] = {{u32(0), "Signed"}, {u32(0), "Unsigned", integer("%u")}};
  EXPECT_EQ(shown({0xFF, 0xFF, 0xFF, 0xFF}, fields), R"({Signed: "-1", Unsigned: "4294967295"})");
  EXPECT_EQ(shown({0x00, 0x00, 0x00, 0x80}, fields), R"({Signed: "-2147483648", Unsigned: "2147483648"})");
}

TEST(Field, ScalesIntegers) {
  static constexpr Field fields[] = {
      {u8(0), "Plain", integer("%d dBm", 1, -30)},
      {u8(0), "Doubled", integer("about %d ms.", 2, 1)},
      {u8(0), "Negated", integer("%d", -1)},
      {s16(1), "Signed", integer("%d", 3, 1)},
  };
  EXPECT_EQ(shown({0x0A, 0xFE, 0xFF}, fields),
            R"({Plain: "-20 dBm", Doubled: "about 21 ms.", Negated: "-10", Signed: "-5"})");
}

TEST(Field, ScaledIntegersWrapTo32Bits) {
  static constexpr Field fields[] = {{u32(0), "Doubled", integer("%d", 2)},
                                     {u32(0), "Next", integer("%u", 1, 1)}};
  EXPECT_EQ(shown({0xFF, 0xFF, 0xFF, 0xFF}, fields), R"({Doubled: "-2", Next: "0"})");
  EXPECT_EQ(shown({0x00, 0x00, 0x00, 0x40}, fields), R"({Doubled: "-2147483648", Next: "1073741825"})");
}

TEST(Field, ShowsReals) {
  static constexpr Field fields[] = {
      {u16(0), "Rsrp", real("%4.2f dBm", 0.0625, -180.0)},
      {u8(0), "Default", real("%f")},
      {u8(0), "Whole", real("%.0f", 0.5)},
      {s16(0), "Signed", real("%.1f dB", 0.5)},
  };
  // 0x0315 is 789.
  EXPECT_EQ(shown({0x15, 0x03}, fields),
            R"({Rsrp: "-130.69 dBm", Default: "21.000000", Whole: "10", Signed: "394.5 dB"})");
  EXPECT_EQ(shown({0xFF, 0xFF}, fields),
            R"({Rsrp: "3915.94 dBm", Default: "255.000000", Whole: "128", Signed: "-0.5 dB"})");
}

TEST(Field, PadsRealsOnTheLeftToTheirWidth) {
  static constexpr Field fields[] = {{u8(0), "Wide", real("%8.2f|")},
                                     {u8(0), "Narrow", real("%4.2f|", 100.0)}};
  EXPECT_EQ(shown({0x05}, fields), R"({Wide: "    5.00|", Narrow: "500.00|"})");
}

TEST(Field, RoundsRealsAsTheyAreInBinary) {
  static constexpr Field fields[] = {
      {u8(0), "Half", real("%.2f", 0.125)},        // 0.125 is halfway and goes to the even digit
      {u8(0), "Below", real("%.2f", 0.015)},       // 0.015 is a little below halfway
      {u8(0), "Small", real("%.1f", 0.01, -0.05)}  // a negative number that rounds to zero keeps its sign
  };
  EXPECT_EQ(shown({0x01}, fields), R"({Half: "0.12", Below: "0.01", Small: "-0.0"})");
}

TEST(Field, ShowsTheTextOfAChoiceOrElseTheOtherOne) {
  static constexpr Choice modes[] = {{0, "Off"}, {7, "On"}};
  static constexpr Field fields[] = {{u8(0), "Mode", choice(modes, "Unknown")}};
  EXPECT_EQ(shown({0x00}, fields), R"({Mode: "Off"})");
  EXPECT_EQ(shown({0x07}, fields), R"({Mode: "On"})");
  EXPECT_EQ(shown({0x01}, fields), R"({Mode: "Unknown"})");
  EXPECT_EQ(shown({0xFF}, fields), R"({Mode: "Unknown"})");
}

TEST(Field, ShowsTheEntryThatTheRawValueCountsFrom0OrElseTheOtherText) {
  static constexpr std::string_view states[] = {"First", "Second"};
  static constexpr Field fields[] = {{u8(0), "State", entry(states)},
                                     {u8(0), "Time", entry(states, "?? ms")}};
  EXPECT_EQ(shown({0}, fields), R"({State: "First", Time: "First"})");
  EXPECT_EQ(shown({1}, fields), R"({State: "Second", Time: "Second"})");
  EXPECT_EQ(shown({2}, fields), R"({State: "Unknown", Time: "?? ms"})");
  EXPECT_EQ(shown({255}, fields), R"({State: "Unknown", Time: "?? ms"})");
}

TEST(Field, ScalesSignedBytes) {
  static constexpr Field fields[] = {{s8(0), "Level", integer("%d dB", 1, -21)},
                                     {s8(0), "Half", real("%f", 0.5)}};
  EXPECT_EQ(shown({0x80}, fields), R"({Level: "-149 dB", Half: "-64.000000"})");
  EXPECT_EQ(shown({0x7F}, fields), R"({Level: "106 dB", Half: "63.500000"})");
}

TEST(Field, ShowsNumbersThatWereWorkedOut) {
  Dictionary record;
  setInteger(record, "Level", integer("%d dBm", 2), -7);
  EXPECT_EQ(described(record), R"({Level: "-14 dBm"})");
  Formatter formatter;
  EXPECT_EQ(formatter.text(real("%4.2f dBm"), -15.0), "-15.00 dBm");
  EXPECT_EQ(formatter.text(real("%4.2f dBm"), std::numeric_limits<double>::quiet_NaN()), " nan dBm");
  EXPECT_EQ(formatter.text(real("%f"), -std::numeric_limits<double>::infinity()), "-inf");
}

TEST(Field, ARecordThatDoesNotFitIsLeftOutOrReadAsZeros) {
  static constexpr Field fields[] = {{u16(0), "A"}};
  const Bytes bytes = {9, 1, 0, 2, 0, 3};
  Array whole, counted;
  addRecords(whole, Packet(bytes), {1, 2, 4}, fields);
  addCountedRecords(counted, Packet(bytes), {1, 2, 4}, fields);
  EXPECT_EQ(described(Value::ofArray(whole)), R"([{A: "1"}, {A: "2"}])");
  EXPECT_EQ(described(Value::ofArray(counted)), R"([{A: "1"}, {A: "2"}, {A: "3"}, {A: "0"}])");
}

TEST(Field, OneRawValueMayHaveATextOfItsOwn) {
  static constexpr Field fields[] = {
      {u8(0), "Power", integer("%d dBm", 1, -30).unless(64, "Not Present")},
      {u8(0), "Level", real("%.1f", 0.5).unless(65, "None")},
  };
  EXPECT_EQ(shown({63}, fields), R"({Power: "33 dBm", Level: "31.5"})");
  EXPECT_EQ(shown({64}, fields), R"({Power: "Not Present", Level: "32.0"})");
  EXPECT_EQ(shown({65}, fields), R"({Power: "35 dBm", Level: "None"})");
}

TEST(Field, ShowsSignedBytes) {
  static constexpr Field fields[] = {{s8(0), "Low"}, {s8(1), "High"}};
  EXPECT_EQ(shown({0x80, 0x7F}, fields), R"({Low: "-128", High: "127"})");
}

TEST(Field, ThePlusFlagShowsTheSignOfEveryNumber) {
  static constexpr Field fields[] = {{s8(0), "Integer", integer("%+d dBm")},
                                     {s8(0), "Real", real("%+.2f dB", 0.25)},
                                     {s8(0), "Wide", real("%+7.2f", 0.25)}};
  EXPECT_EQ(shown({5}, fields), R"({Integer: "+5 dBm", Real: "+1.25 dB", Wide: "  +1.25"})");
  EXPECT_EQ(shown({0}, fields), R"({Integer: "+0 dBm", Real: "+0.00 dB", Wide: "  +0.00"})");
  EXPECT_EQ(shown({0xFB}, fields), R"({Integer: "-5 dBm", Real: "-1.25 dB", Wide: "  -1.25"})");
}

TEST(Field, ShowsHexadecimals) {
  static constexpr Field fields[] = {{u32(0), "Plain", hexadecimal("%x")},
                                     {u32(0), "Wide", hexadecimal("0x%06x.")},
                                     {u32(0), "Blanks", hexadecimal("%6x")}};
  EXPECT_EQ(shown({0xBC, 0x0A, 0, 0}, fields), R"({Plain: "abc", Wide: "0x000abc.", Blanks: "   abc"})");
  EXPECT_EQ(shown({0x78, 0x56, 0x34, 0xF2}, fields),
            R"({Plain: "f2345678", Wide: "0xf2345678.", Blanks: "f2345678"})");
}

TEST(Field, APercentSignBehindTheNumberIsWrittenTwice) {
  static constexpr Field fields[] = {{u8(0), "Share", real("%.02f%% (old)")},
                                     {u8(0), "Whole", integer("%d%%")}};
  EXPECT_EQ(shown({3}, fields), R"~({Share: "3.00% (old)", Whole: "3%"})~");
}

TEST(Field, ARawValueThatIsNoChoiceMayShowAsANumber) {
  static constexpr Choice modes[] = {{0, "Off"}, {7, "On"}};
  static constexpr Field fields[] = {{u32(0), "Mode", choice(modes, integer("[Bad Value %d]"))}};
  EXPECT_EQ(shown({7, 0, 0, 0}, fields), R"({Mode: "On"})");
  EXPECT_EQ(shown({8, 0, 0, 0}, fields), R"({Mode: "[Bad Value 8]"})");
  EXPECT_EQ(shown({0xFF, 0xFF, 0xFF, 0xFF}, fields), R"({Mode: "[Bad Value -1]"})");
}

TEST(Formatter, ShowsComputedNumbersAsTheyAre) {
  Formatter formatter;
  EXPECT_EQ(formatter.text(real("%+.2f dB", 7.0, 9.0), -2.5), "-2.50 dB");
  EXPECT_EQ(formatter.text(real("%.2f kbps"), 1234.567), "1234.57 kbps");
}

TEST(Formatter, ShowsNumbersWithoutEnd) {
  constexpr double infinity = std::numeric_limits<double>::infinity();
  Formatter formatter;
  EXPECT_EQ(formatter.text(real("%+.2f dB"), -infinity), "-inf dB");
  EXPECT_EQ(formatter.text(real("%+.2f dB"), infinity), "+inf dB");
}

TEST(Formatter, WhatIsNotANumberShowsNoMinus) {
  constexpr double notANumber = std::numeric_limits<double>::quiet_NaN();
  Formatter formatter;
  EXPECT_EQ(formatter.text(real("%.2f"), notANumber), "nan");
  EXPECT_EQ(formatter.text(real("%.2f"), -notANumber), "nan");
}

TEST(Field, ReadsRunsOfBits) {
  static constexpr Field fields[] = {
      {bits(0, 0, 1), "Flag"}, {bits(0, 1, 9), "Run"}, {bits(1, 2, 6), "Rest"}, {bits(0, 4, 32), "Long"}};
  // 0xA5 is 1010 0101, 0x36 is 0011 0110.
  EXPECT_EQ(shown({0xA5, 0x36, 0x00, 0x00, 0x00}, fields),
            R"({Flag: "1", Run: "338", Rest: "13", Long: "874"})");
}

TEST(Field, RowsStandInTheOrderOfTheTableAndKeepTheirPlaces) {
  static constexpr Field fields[] = {{u8(1), "B"}, {u8(0), "A"}};
  Dictionary section;
  section.set("A", "old");
  section.set("Other", "kept");
  const Bytes bytes = {1, 2};
  setFields(section, Packet(bytes), fields);
  EXPECT_EQ(described(section), R"({A: "1", Other: "kept", B: "2"})");
}

TEST(Field, ReadsZerosPastTheEndOfThePacket) {
  static constexpr Field fields[] = {{u8(9), "Far"}, {u16(1), "Half"}};
  EXPECT_EQ(shown({0x11, 0x22}, fields), R"({Far: "0", Half: "34"})");
}

TEST(Field, TheExtentIsTheEndOfTheLastByteRead) {
  static constexpr Field fields[] = {
      {u8(13), "Version"}, {bits(20, 1, 4), "In a byte"}, {bits(22, 1, 9), "R"}};
  static_assert(extent(fields) == 24);
  static constexpr Field fullByte[] = {{bits(4, 3, 5), "To its last bit"}};
  static_assert(extent(fullByte) == 5);
  static constexpr Field aBitMore[] = {{bits(4, 3, 6), "Into the next"}};
  static_assert(extent(aBitMore) == 6);
}

}  // namespace
}  // namespace varnel
