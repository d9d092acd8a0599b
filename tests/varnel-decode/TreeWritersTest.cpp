#include "programs/varnel-decode/TreeWriters.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <initializer_list>
#include <stdexcept>
#include <utility>

#include "base/Dictionary.h"
#include "base/PropertyList.h"

namespace varnel {

namespace {

Value dictionary(std::initializer_list<std::pair<const char*, Value>> entries) {
  Value result = Value::ofDictionary();
  for (const auto& [key, value] : entries) result.dictionary()->set(key, value);
  return result;
}

const Value absent;

TEST(TreeAsText, NestedRowsAreIndentedAndAligned) {
  const Value display =
      dictionary({{"Cell", dictionary({{"ID", "7"}, {"RSSI", "-90"}})}, {"List", Value::ofArray()}});
  EXPECT_EQ(displayAsText(display), "Cell\n  ID    7\n  RSSI  -90\nList\n");
}

TEST(TreeAsText, AnAbsentDisplayIsUnknown) { EXPECT_EQ(displayAsText(absent), "(unknown)\n"); }

TEST(TreeAsPaths, NodesStandInPreOrderLeavesWithTheirValue) {
  const Value display = dictionary({
      {"Cell", dictionary({{"ID", "7"}, {"Name", ""}})},
      {"List", Value::ofArray({dictionary({{"A", "1"}}), "two"})},
      {"Empty", Value::ofDictionary()},
  });
  EXPECT_EQ(displayAsPaths(display),
            "/\n"
            "/Cell\n"
            "/Cell/ID\t7\n"
            "/Cell/Name\t\n"
            "/List\n"
            "/List/0\n"
            "/List/0/A\t1\n"
            "/List/1\ttwo\n"
            "/Empty\n");
}

TEST(TreeAsPaths, SortedKeysAreShownByTheirNamesInTheOrderOfTheirKeys) {
  const Value display = dictionary({{"2;B", "b"}, {"_sorted", "1"}, {"10;A", "a"}, {"C", "c"}});
  EXPECT_EQ(displayAsPaths(display), "/\n/A\ta\n/B\tb\n/C\tc\n");
}

TEST(TreeAsPaths, BackslashTabNewlineAndReturnAreEscapedInPathAndValue) {
  const Value display = dictionary({{"a\\b\tc\nd\re", "f\\g\th\ni\rj"}});
  EXPECT_EQ(displayAsPaths(display), "/\n/a\\\\b\\tc\\nd\\re\tf\\\\g\\th\\ni\\rj\n");
}

TEST(TreeAsPaths, NamesMayHoldSlashesAndBeEmpty) {
  const Value display = dictionary({{"_sorted", ""}, {"1;", dictionary({{"a/b", "c"}})}});
  EXPECT_EQ(displayAsPaths(display), "/\n/\n/a/b\tc\n");
}

TEST(TreeAsPaths, AnAbsentDisplayIsOneUnknownLeaf) { EXPECT_EQ(displayAsPaths(absent), "/\t(unknown)\n"); }

TEST(TreeAsJson, DictionariesAreObjectsInTreeOrderAndArraysAreArrays) {
  const Value display = dictionary({
      {"Z", dictionary({{"ID", "7"}})},
      {"A", Value::ofArray({"x", dictionary({{"y", "1"}}), Value::ofArray()})},
      {"Empty", Value::ofDictionary()},
  });
  EXPECT_EQ(displayAsJson(display), R"({"Z":{"ID":"7"},"A":["x",{"y":"1"},[]],"Empty":{}})"
                                    "\n");
}

TEST(TreeAsJson, NamesThatCoincideAreWrittenTwice) {
  const Value display = dictionary({{"_sorted", ""}, {"1;A", "x"}, {"2;A", "y"}});
  EXPECT_EQ(displayAsJson(display), "{\"A\":\"x\",\"A\":\"y\"}\n");
}

TEST(TreeAsJson, WhatIsNoTextIsUnknown) {
  const Value display = dictionary({{"number", Value::ofInteger(7)}, {"data", Value::ofData({1, 2})}});
  EXPECT_EQ(displayAsJson(display), "{\"number\":\"(unknown)\",\"data\":\"(unknown)\"}\n");
}

TEST(TreeAsJson, NamesAndValuesAreQuoted) {
  const Value display = dictionary({{"a\"b\\", "tab\t newline\n bell\x07 \xC3\xA9 / end"}});
  EXPECT_EQ(displayAsJson(display), "{\"a\\\"b\\\\\":\"tab\\t newline\\n bell\\u0007 \xC3\xA9 / end\"}\n");
}

TEST(TreeAsJson, BytesThatAreNoUTF8BecomeTheReplacementCharacter) {
  EXPECT_EQ(displayAsJson(dictionary({{"a", "x\xFFy"}})), "{\"a\":\"x\xEF\xBF\xBDy\"}\n");
}

TEST(TreeAsJson, ADisplayThatIsOneValueIsThatValue) {
  EXPECT_EQ(displayAsJson(absent), "\"(unknown)\"\n");
  EXPECT_EQ(displayAsJson(Value("text")), "\"text\"\n");
  EXPECT_EQ(displayAsJson(Value::ofArray()), "[]\n");
}

TEST(DisplayAsPropertyList, EveryKindOfValueAndTheOrderOfKeysAreKept) {
  const Value display = dictionary({{"_sorted", "yes"},
                                    {"2;B", Value::ofInteger(-7)},
                                    {"1;A", Value::ofArray({"x", Value::ofBoolean(true)})},
                                    {"data", Value::ofData({1, 2})}});
  const std::string written = displayAsPropertyList(display);
  const auto* bytes = reinterpret_cast<const std::uint8_t*>(written.data());
  const auto list = readPropertyList({bytes, written.size()}, fileLimits);
  ASSERT_TRUE(list && list->dictionary()) << written;
  std::string keys;
  for (const auto& [key, value] : *list->dictionary()) keys += key + " ";
  EXPECT_EQ(keys, "_sorted 2;B 1;A data ");
  EXPECT_EQ(list->dictionary()->get("2;B").integer(), -7);
  ASSERT_TRUE(list->dictionary()->get("1;A").array());
  EXPECT_EQ(list->dictionary()->get("1;A").array()->at(1).boolean(), true);
  ASSERT_TRUE(list->dictionary()->get("data").data());
  EXPECT_EQ(*list->dictionary()->get("data").data(), (Bytes{1, 2}));
  EXPECT_TRUE(written.starts_with("<?xml")) << written;
}

TEST(DisplayAsPropertyList, WithoutADisplayThereIsNothing) { EXPECT_EQ(displayAsPropertyList(absent), ""); }

TEST(DisplayAsPropertyList, ATextThatXMLCannotHoldIsAnError) {
  EXPECT_THROW(displayAsPropertyList(dictionary({{"a", "\x01"}})), std::runtime_error);
}

}  // namespace

}  // namespace varnel
