#include "programs/varnel-decode/DisplayJson.h"

#include <gtest/gtest.h>

#include <initializer_list>
#include <utility>

#include "base/Dictionary.h"

namespace varnel {
namespace {

Value rows(std::initializer_list<std::pair<const char*, Value>> entries) {
  Value value = Value::ofDictionary();
  for (const auto& [name, content] : entries) value.dictionary()->set(name, content);
  return value;
}

Value list(std::initializer_list<Value> records) {
  Value value = Value::ofArray();
  for (const Value& record : records) value.array()->push_back(record);
  return value;
}

TEST(DisplayJson, RecordsOfAListShareTheirUnits) {
  NumberFormats formats;
  formats.add("Neighbors", "RSRP", real("%4.2f dBm"));
  formats.add("Neighbors", "RSRQ", real("%4.2f dB"));
  const auto [display, units] =
      displayJson(rows({{"LTE", rows({{"Neighbors", list({rows({{"RSRP", "-1.25 dBm"}}),
                                                          rows({{"RSRP", ""}, {"RSRQ", "-3.00 dB"}})})}})}}),
                  ValuesAs::Numbers, formats);
  EXPECT_EQ(display.text(), R"({"LTE":{"Neighbors":[{"RSRP":-1.25},{"RSRQ":-3.00}]}})");
  EXPECT_EQ(units.text(), R"({"LTE":{"Neighbors":{"RSRP":"dBm","RSRQ":"dB"}}})");
}

TEST(DisplayJson, WhatStandsInAnEntryHasItsUnit) {
  NumberFormats formats;
  formats.add("1x", "Active Set", real("%+.2f dB"));
  const auto [display, units] =
      displayJson(rows({{"1x", rows({{"Active Set", rows({{"84", "+1.50 dB"}, {"90", "-2.00 dB"}})}})}}),
                  ValuesAs::Numbers, formats);
  EXPECT_EQ(display.text(), R"({"1x":{"Active Set":{"84":1.50,"90":-2.00}}})");
  EXPECT_EQ(units.text(), R"({"1x":{"Active Set":"dB"}})");
}

TEST(DisplayJson, WhatIsAbsentIsLeftOutAndKeepsItsPlaceInALists) {
  const Value display =
      rows({{"List", list({"1", "", Value::ofInteger(7)})}, {"Text", ""}, {"Section", rows({})}});
  EXPECT_EQ(displayJson(display, ValuesAs::Numbers, {}).display.text(),
            R"({"List":[1,null,null],"Section":{}})");
  EXPECT_EQ(displayJson(display, ValuesAs::Texts, {}).display.text(),
            "{\"List\":[\"1\",\"\",\"(unknown)\"],\"Text\":\"\",\"Section\":{}}");
}

TEST(DisplayJson, OfANameThatOccursTwiceTheLaterValueCounts) {
  const Value display = rows({{"_sorted", ""}, {"10;Name", "a"}, {"20;Name", "b"}});
  EXPECT_EQ(displayJson(display, ValuesAs::Texts, {}).display.text(), R"({"Name":"b"})");
}

}  // namespace
}  // namespace varnel
