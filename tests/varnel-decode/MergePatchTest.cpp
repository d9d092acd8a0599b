#include "programs/varnel-decode/MergePatch.h"

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

namespace varnel {
namespace {

using Json = nlohmann::ordered_json;

JsonValue valueOf(const Json& json) {
  if (!json.is_object()) return JsonValue::ofText(json.dump());
  JsonValue object = JsonValue::ofObject();
  for (const auto& [name, value] : json.items()) object.setMember(Json(name).dump(), valueOf(value));
  return object;
}

std::string patchBetween(const char* before, const char* after) {
  const auto patch = mergePatch(valueOf(Json::parse(before)), valueOf(Json::parse(after)));
  return patch ? patch->text() : "equal";
}

TEST(MergePatch, HoldsTheMembersThatDiffer) {
  EXPECT_EQ(patchBetween(R"({"a":1,"b":2,"c":{"d":"x","e":"y"}})", R"({"a":1,"b":3,"c":{"d":"x","e":"z"}})"),
            R"({"b":3,"c":{"e":"z"}})");
}

TEST(MergePatch, OfWhatIsEqualThereIsNone) {
  EXPECT_EQ(patchBetween(R"({"a":{"b":[1,2]},"c":{}})", R"({"c":{},"a":{"b":[1,2]}})"), "equal");
  EXPECT_EQ(patchBetween("7", "7"), "equal");
}

TEST(MergePatch, WhatIsGoneIsNull) {
  EXPECT_EQ(patchBetween(R"({"a":1,"b":{"c":2}})", "{}"), R"({"a":null,"b":null})");
  EXPECT_EQ(patchBetween(R"({"b":{"c":2}})", R"({"b":{}})"), R"({"b":{"c":null}})");
}

TEST(MergePatch, ArraysAreReplacedWhole) {
  EXPECT_EQ(patchBetween(R"({"a":[{"b":1},{"b":2}]})", R"({"a":[{"b":1},{"b":3}]})"),
            R"({"a":[{"b":1},{"b":3}]})");
}

TEST(MergePatch, WhatBecomesAnotherKindIsReplacedWhole) {
  EXPECT_EQ(patchBetween(R"({"a":{"b":1}})", R"({"a":[]})"), R"({"a":[]})");
  EXPECT_EQ(patchBetween(R"({"a":"{}"})", R"({"a":{}})"), R"({"a":{}})");
  EXPECT_EQ(patchBetween(R"("x")", R"({"a":1})"), R"({"a":1})");
}

// A different implementation applies the patches.
TEST(MergePatch, AppliedToTheOneValueGivesTheOther) {
  const char* const values[] = {
      R"({})",
      R"({"a":{}})",
      R"({"a":{"b":"1","c":{"d":2}},"e":[1,{"f":2}]})",
      R"({"e":[1,{"f":3}],"a":{"c":{"d":2,"g":"\u00e9\""}}})",
      R"({"a":"text","e":{"0":1}})",
      R"({"":{"":{"":7}}})",
  };
  for (const char* const before : values) {
    for (const char* const after : values) {
      Json patched = Json::parse(before);
      const std::string patch = patchBetween(before, after);
      if (patch != "equal") patched.merge_patch(Json::parse(patch));
      EXPECT_EQ(nlohmann::json(patched), nlohmann::json(Json::parse(after))) << before << " and " << patch;
    }
  }
}

TEST(JsonValue, AMemberThatIsSetAgainKeepsItsPlace) {
  JsonValue object = JsonValue::ofObject();
  object.setMember("\"a\"", JsonValue::ofText("1"));
  object.objectAt("\"b\"").setMember("\"c\"", JsonValue::ofText("2"));
  object.objectAt("\"b\"").setMember("\"d\"", JsonValue::ofText("3"));
  object.setMember("\"a\"", JsonValue::ofText("4"));
  EXPECT_EQ(object.text(), R"({"a":4,"b":{"c":2,"d":3}})");
}

}  // namespace
}  // namespace varnel
