#include "base/FitForXml.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "base/Dictionary.h"
#include "base/PropertyList.h"

namespace varnel {
namespace {

using namespace std::string_literals;

std::string fit(const std::string& text) { return *fitForXml(Value(text)).string(); }

TEST(FitForXml, WhatXmlCannotHoldBecomesTheReplacementCharacter) {
  EXPECT_EQ(fit("a\x01"
                "b\x1F"
                "c"),
            "a\uFFFDb\uFFFDc");
  EXPECT_EQ(fit("a\0b"s), "a\uFFFDb");
  EXPECT_EQ(fit("\xEF\xBF\xBE\xEF\xBF\xBF"), "\uFFFD\uFFFD");  // U+FFFE and U+FFFF
}

TEST(FitForXml, AByteThatIsNoUtf8BecomesOneToo) {
  EXPECT_EQ(fit("a\xFFz"), "a\uFFFDz");
  EXPECT_EQ(fit("a\xC3"), "a\uFFFD");
  EXPECT_EQ(fit("\xE2\x82z"), "\uFFFD\uFFFDz");
}

TEST(FitForXml, AllElseStays) {
  const std::string text = "tab\t, lines\r\n, \x7F, \u00E9, \u20AC, \U0001F4F6, \uFFFD";
  EXPECT_EQ(fit(text), text);
}

TEST(FitForXml, TheValueItselfIsNotTouched) {
  Value row = Value::ofDictionary();
  row.dictionary()->set("APN", "a\x02");
  const Value list = Value::ofArray({row, Value::ofDictionary()});
  const Value replaced = fitForXml(list);
  EXPECT_EQ(*replaced.array()->at(0).dictionary()->get("APN").string(), "a\uFFFD");
  EXPECT_EQ(*row.dictionary()->get("APN").string(), "a\x02");
  // Parts that need no replacement are shared.
  EXPECT_EQ(replaced.array()->at(1).dictionary(), list.array()->at(1).dictionary());
}

TEST(FitForXml, KeysThatBecomeTheSameStayApart) {
  Value value = Value::ofDictionary();
  for (const char* key : {"\x01", "\x02", "\uFFFD"}) value.dictionary()->set(key, "x");
  std::vector<std::string> keys;
  const Value replaced = fitForXml(value);
  for (const auto& [key, entry] : *replaced.dictionary()) keys.push_back(key);
  EXPECT_EQ(keys, (std::vector<std::string>{"\uFFFD", "\uFFFD (2)", "\uFFFD (3)"}));
}

TEST(FitForXml, WhatHasNoEndBecomesTheAbsentValue) {
  const Value endless = Value::ofArray({Value("\x01")});
  endless.array()->push_back(endless);
  EXPECT_TRUE(fitForXml(endless).isAbsent());
  endless.array()->clear();
}

TEST(FitForXml, TheResultHasAnXmlForm) {
  Value value = Value::ofDictionary();
  value.dictionary()->set("k\x03", Value::ofArray({Value("v\x04"), Value::ofInteger(7)}));
  EXPECT_FALSE(writeXmlPropertyList(value));
  EXPECT_TRUE(writeXmlPropertyList(fitForXml(value)));
}

}  // namespace
}  // namespace varnel
