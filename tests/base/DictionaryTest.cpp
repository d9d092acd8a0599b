#include "base/Dictionary.h"

#include <gtest/gtest.h>

#include <iterator>
#include <string>
#include <utility>

using namespace varnel;

namespace {

std::string keysOf(const Dictionary& dictionary) {
  std::string keys;
  for (const auto& [key, value] : dictionary) keys += key + ' ';
  return keys;
}

std::string textOf(const Dictionary& dictionary, std::string_view key) {
  const std::string* text = dictionary.get(key).string();
  return text ? *text : "no text";
}

// "0", "1", ... each with its own key as its text.
Dictionary numbered(int count) {
  Dictionary dictionary;
  for (int i = 0; i < count; ++i) dictionary.set(std::to_string(i), std::to_string(i));
  return dictionary;
}

}  // namespace

TEST(Dictionary, StartsEmpty) {
  const Dictionary dictionary;
  EXPECT_TRUE(dictionary.empty());
  EXPECT_EQ(dictionary.size(), 0U);
  EXPECT_FALSE(dictionary.has(""));
  EXPECT_TRUE(dictionary.get("a").isAbsent());
}

TEST(Dictionary, KeepsTheOrderOfFirstSetting) {
  Dictionary dictionary;
  for (const char* key : {"z", "a", "m", "", "b"}) dictionary.set(key, "text");
  EXPECT_EQ(keysOf(dictionary), "z a m  b ");
}

TEST(Dictionary, SettingAKeyAgainKeepsItsPlace) {
  Dictionary dictionary;
  dictionary.set("a", "1");
  dictionary.set("b", "2");
  dictionary.set("c", "3");
  dictionary.set("a", "4");
  dictionary.set("b", Value::ofInteger(5));
  EXPECT_EQ(keysOf(dictionary), "a b c ");
  EXPECT_EQ(textOf(dictionary, "a"), "4");
  EXPECT_EQ(dictionary.get("b").integer(), 5);
  EXPECT_EQ(textOf(dictionary, "c"), "3");
}

TEST(Dictionary, ARemovedKeySetAgainGoesToTheEnd) {
  Dictionary dictionary;
  dictionary.set("a", "1");
  dictionary.set("b", "2");
  dictionary.set("c", "3");
  dictionary.remove("a");
  EXPECT_EQ(keysOf(dictionary), "b c ");
  EXPECT_FALSE(dictionary.has("a"));
  dictionary.set("a", "4");
  EXPECT_EQ(keysOf(dictionary), "b c a ");
}

TEST(Dictionary, RemovingAForeignKeyChangesNothing) {
  Dictionary dictionary;
  dictionary.remove("a");
  dictionary.set("a", "1");
  dictionary.remove("b");
  EXPECT_EQ(keysOf(dictionary), "a ");
}

TEST(Dictionary, SettingTheAbsentValueChangesNothing) {
  Dictionary dictionary;
  dictionary.set("a", "1");
  dictionary.set("a", Value());
  dictionary.set("b", Value());
  EXPECT_EQ(keysOf(dictionary), "a ");
  EXPECT_EQ(textOf(dictionary, "a"), "1");
}

TEST(Dictionary, KeysDifferInCaseAndLength) {
  Dictionary dictionary;
  dictionary.set("Key", "1");
  EXPECT_FALSE(dictionary.has("key"));
  EXPECT_FALSE(dictionary.has("Ke"));
  EXPECT_FALSE(dictionary.has("Keys"));
  EXPECT_TRUE(dictionary.has("Key"));
}

TEST(Dictionary, FindsEveryKeyInAnyOrderOfAsking) {
  for (const int count : {1, 47, 48, 49, 50, 300}) {
    const Dictionary dictionary = numbered(count);
    EXPECT_EQ(dictionary.size(), static_cast<std::size_t>(count));
    for (int i = 0; i < count; ++i) EXPECT_EQ(textOf(dictionary, std::to_string(i)), std::to_string(i));
    for (int i = count - 1; i >= 0; --i) EXPECT_EQ(textOf(dictionary, std::to_string(i)), std::to_string(i));
    for (int i = 0; i < count; ++i) {
      const std::string key = std::to_string(i * 7 % count);
      EXPECT_EQ(textOf(dictionary, key), key);
      EXPECT_FALSE(dictionary.has("x" + key));
    }
  }
}

TEST(Dictionary, StaysRightWhileItShrinksAndGrowsAcrossTheSmallSize) {
  Dictionary dictionary = numbered(52);
  for (int i = 0; i < 52; i += 2) {
    dictionary.remove(std::to_string(i));
    EXPECT_FALSE(dictionary.has(std::to_string(i)));
    for (int odd = 1; odd < 52; odd += 2)
      EXPECT_EQ(textOf(dictionary, std::to_string(odd)), std::to_string(odd));
  }
  EXPECT_EQ(dictionary.size(), 26U);
  for (int i = 0; i < 52; i += 2) dictionary.set(std::to_string(i), "again");
  EXPECT_EQ(dictionary.size(), 52U);
  EXPECT_EQ(keysOf(dictionary),
            "1 3 5 7 9 11 13 15 17 19 21 23 25 27 29 31 33 35 37 39 41 43 45 47 49 51 "
            "0 2 4 6 8 10 12 14 16 18 20 22 24 26 28 30 32 34 36 38 40 42 44 46 48 50 ");
  EXPECT_EQ(textOf(dictionary, "50"), "again");
  EXPECT_EQ(textOf(dictionary, "51"), "51");
}

TEST(Dictionary, RemovesFromALargeOneInPlace) {
  Dictionary dictionary = numbered(60);
  dictionary.remove("0");
  dictionary.remove("59");
  dictionary.remove("30");
  EXPECT_EQ(dictionary.size(), 57U);
  EXPECT_EQ(textOf(dictionary, "1"), "1");
  EXPECT_EQ(textOf(dictionary, "31"), "31");
  EXPECT_EQ(textOf(dictionary, "58"), "58");
  dictionary.set("58", "last");
  EXPECT_EQ(dictionary.size(), 57U);
  EXPECT_EQ(std::prev(dictionary.end())->key, "58");
}

TEST(Dictionary, SetTextUsesTheRoomOfTheTextThatIsThere) {
  Dictionary dictionary;
  dictionary.setText("a", "a text that is longer than short ones");
  const char* room = dictionary.get("a").string()->data();
  dictionary.setText("a", "another text, not longer than that");
  EXPECT_EQ(dictionary.get("a").string()->data(), room);
  EXPECT_EQ(textOf(dictionary, "a"), "another text, not longer than that");
  EXPECT_EQ(dictionary.size(), 1U);
}

TEST(Dictionary, SetTextReplacesOtherKindsAndAddsNewKeys) {
  Dictionary dictionary;
  dictionary.set("a", Value::ofInteger(1));
  dictionary.set("b", Value::ofArray({"x"}));
  dictionary.setText("b", "2");
  dictionary.setText("c", "");
  dictionary.setText("a", "1");
  EXPECT_EQ(keysOf(dictionary), "a b c ");
  EXPECT_EQ(textOf(dictionary, "a"), "1");
  EXPECT_EQ(textOf(dictionary, "b"), "2");
  EXPECT_EQ(textOf(dictionary, "c"), "");
}

TEST(Dictionary, SetTextLeavesCopiesOfTheValueAlone) {
  Dictionary dictionary;
  dictionary.setText("a", "old");
  const Value copy = dictionary.get("a");
  dictionary.setText("a", "new");
  EXPECT_EQ(*copy.string(), "old");
}

TEST(Dictionary, FindTellsThePositionOfAKey) {
  Dictionary dictionary;
  EXPECT_EQ(dictionary.find("a"), Dictionary::nowhere);
  dictionary.set("a", "1");
  dictionary.set("b", "2");
  EXPECT_EQ(dictionary.find("b"), 1u);
  EXPECT_TRUE(dictionary.hasAt(1, "b"));
  EXPECT_FALSE(dictionary.hasAt(0, "b"));
  EXPECT_FALSE(dictionary.hasAt(2, "b"));
  dictionary.remove("a");
  EXPECT_EQ(dictionary.find("b"), 0u);
  EXPECT_EQ(dictionary.find("a"), Dictionary::nowhere);
}

TEST(Dictionary, TheValueAtAPositionCanBeReplaced) {
  Dictionary dictionary;
  dictionary.set("a", "1");
  dictionary.set("b", "2");
  dictionary.at(1).assignText("3");
  EXPECT_EQ(textOf(dictionary, "b"), "3");
  dictionary.at(0) = Value::ofInteger(4);
  EXPECT_EQ(dictionary.at(0).integer(), 4);
  EXPECT_EQ(keysOf(dictionary), "a b ");
}

TEST(Dictionary, AddPutsAnEntryAtTheEnd) {
  Dictionary dictionary = numbered(60);
  dictionary.add("last", "1");
  EXPECT_EQ(dictionary.find("last"), 60u);
  EXPECT_EQ(textOf(dictionary, "last"), "1");
}

TEST(Dictionary, WriteAtKeepsAnEntryThatHasTheKey) {
  Dictionary dictionary;
  dictionary.set("a", "1");
  dictionary.set("b", "2");
  dictionary.writeAt(0, "a", "3");
  EXPECT_EQ(keysOf(dictionary), "a b ");
  EXPECT_EQ(textOf(dictionary, "a"), "3");
  dictionary.writeAt(2, "c", "4");
  EXPECT_EQ(keysOf(dictionary), "a b c ");
}

TEST(Dictionary, WriteAtRemovesTheEntriesBehindAnotherKey) {
  Dictionary dictionary;
  for (const char* key : {"a", "b", "c"}) dictionary.set(key, "1");
  dictionary.writeAt(1, "c", "2");
  EXPECT_EQ(keysOf(dictionary), "a c ");
  EXPECT_EQ(textOf(dictionary, "c"), "2");
}

TEST(Dictionary, TruncateRemovesTheEntriesFromAPositionOn) {
  Dictionary dictionary = numbered(60);
  const std::string first = dictionary.begin()->key;
  const std::string second = (dictionary.begin() + 1)->key;
  dictionary.truncate(60);
  EXPECT_EQ(dictionary.size(), 60u);
  dictionary.truncate(1);
  EXPECT_EQ(dictionary.size(), 1u);
  EXPECT_TRUE(dictionary.has(first));
  EXPECT_FALSE(dictionary.has(second));
  dictionary.set(second, "again");
  EXPECT_EQ(dictionary.find(second), 1u);
  dictionary.truncate(0);
  EXPECT_TRUE(dictionary.empty());
}

// As the walk over a history record does: values go from one key to another of the same dictionary.
TEST(Dictionary, TakesItsOwnValuesAndKeys) {
  Dictionary dictionary;
  dictionary.set("key", "text");
  for (int i = 0; i < 100; ++i) {
    dictionary.set(std::to_string(i), dictionary.get("key"));
    dictionary.set(dictionary.begin()->key, "text");
  }
  EXPECT_EQ(textOf(dictionary, "99"), "text");
  dictionary.remove(dictionary.begin()->key);
  EXPECT_FALSE(dictionary.has("key"));
  EXPECT_EQ(dictionary.size(), 100U);
}

TEST(Dictionary, CopiesAndMovedOnesStandAlone) {
  Dictionary original = numbered(60);
  Dictionary copy = original;
  copy.set("60", "60");
  copy.remove("0");
  EXPECT_EQ(original.size(), 60U);
  EXPECT_EQ(textOf(original, "0"), "0");
  EXPECT_FALSE(original.has("60"));
  const Dictionary moved = std::move(copy);
  EXPECT_EQ(textOf(moved, "60"), "60");
  EXPECT_EQ(moved.begin()->key, "1");
}
