#include "base/Value.h"

#include <gtest/gtest.h>

#include <iterator>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "base/Dictionary.h"

using namespace varnel;

namespace {

// One value of each kind, in the order of Value::Kind.
std::vector<Value> oneOfEach() {
  return {Value(),
          Value("text"),
          Value::ofInteger(1),
          Value::ofReal(1.0),
          Value::ofBoolean(true),
          Value::ofDate({1, 2}),
          Value::ofData({1}),
          Value::ofArray({"a"}),
          Value::ofDictionary()};
}

constexpr double infinity = std::numeric_limits<double>::infinity();

}  // namespace

TEST(Value, IsAbsentByItself) {
  EXPECT_TRUE(Value().isAbsent());
  EXPECT_EQ(Value().kind(), Value::Kind::Absent);
}

TEST(Value, KindsAreTold) {
  const std::vector<Value> values = oneOfEach();
  constexpr Value::Kind kinds[] = {Value::Kind::Absent, Value::Kind::String,  Value::Kind::Integer,
                                   Value::Kind::Real,   Value::Kind::Boolean, Value::Kind::Date,
                                   Value::Kind::Data,   Value::Kind::Array,   Value::Kind::Dictionary};
  ASSERT_EQ(values.size(), std::size(kinds));
  for (std::size_t i = 0; i < values.size(); ++i) {
    EXPECT_EQ(values[i].kind(), kinds[i]);
    EXPECT_EQ(values[i].isAbsent(), i == 0);
  }
}

TEST(Value, AccessorsYieldNothingForOtherKinds) {
  const std::vector<Value> values = oneOfEach();
  for (std::size_t i = 0; i < values.size(); ++i) {
    const Value::Kind kind = values[i].kind();
    EXPECT_EQ(values[i].string() != nullptr, kind == Value::Kind::String);
    EXPECT_EQ(values[i].integer().has_value(), kind == Value::Kind::Integer);
    EXPECT_EQ(values[i].real().has_value(), kind == Value::Kind::Real);
    EXPECT_EQ(values[i].boolean().has_value(), kind == Value::Kind::Boolean);
    EXPECT_EQ(values[i].date().has_value(), kind == Value::Kind::Date);
    EXPECT_EQ(values[i].data() != nullptr, kind == Value::Kind::Data);
    EXPECT_EQ(values[i].array() != nullptr, kind == Value::Kind::Array);
    EXPECT_EQ(values[i].dictionary() != nullptr, kind == Value::Kind::Dictionary);
    EXPECT_EQ(values[i].int32().has_value(), kind == Value::Kind::Integer || kind == Value::Kind::Real);
  }
}

TEST(Value, AccessorsGiveWhatWasPutIn) {
  EXPECT_EQ(*Value("text").string(), "text");
  EXPECT_EQ(*Value(std::string_view("text").substr(1)).string(), "ext");
  EXPECT_EQ(Value::ofInteger(-5).integer(), -5);
  EXPECT_EQ(Value::ofReal(1.5).real(), 1.5);
  EXPECT_EQ(Value::ofBoolean(false).boolean(), false);
  EXPECT_EQ(Value::ofDate({-5, 7}).date()->seconds, -5);
  EXPECT_EQ(Value::ofDate({-5, 7}).date()->microseconds, 7);
  EXPECT_EQ(*Value::ofData({1, 2}).data(), (Bytes{1, 2}));
}

TEST(Value, NullReferencesAreAbsent) {
  EXPECT_TRUE(Value(ArrayRef()).isAbsent());
  EXPECT_TRUE(Value(DictionaryRef()).isAbsent());
}

TEST(Value, Int32WrapsIntegers) {
  EXPECT_EQ(Value::ofInteger(2147483647).int32(), 2147483647);
  EXPECT_EQ(Value::ofInteger(2147483648).int32(), -2147483647 - 1);
  EXPECT_EQ(Value::ofInteger(4294967295).int32(), -1);
  EXPECT_EQ(Value::ofInteger(4294967296 + 7).int32(), 7);
  EXPECT_EQ(Value::ofInteger(-4294967296 - 7).int32(), -7);
  EXPECT_EQ(Value::ofInteger(std::numeric_limits<std::int64_t>::min()).int32(), 0);
  EXPECT_EQ(Value::ofInteger(std::numeric_limits<std::int64_t>::max()).int32(), -1);
}

TEST(Value, Int32TruncatesRealsAndWrapsThem) {
  EXPECT_EQ(Value::ofReal(1.99).int32(), 1);
  EXPECT_EQ(Value::ofReal(-1.99).int32(), -1);
  EXPECT_EQ(Value::ofReal(-0.5).int32(), 0);
  EXPECT_EQ(Value::ofReal(2147483648.5).int32(), -2147483647 - 1);
  EXPECT_EQ(Value::ofReal(4294967295.0).int32(), -1);
  EXPECT_EQ(Value::ofReal(-4294967297.0).int32(), -1);
  EXPECT_EQ(Value::ofReal(1e300).int32(), 0);  // a multiple of 2^32
}

TEST(Value, Int32OfARealThatIsNotFiniteIs0) {
  EXPECT_EQ(Value::ofReal(infinity).int32(), 0);
  EXPECT_EQ(Value::ofReal(-infinity).int32(), 0);
  EXPECT_EQ(Value::ofReal(std::numeric_limits<double>::quiet_NaN()).int32(), 0);
}

TEST(Value, CopiesShareContainers) {
  const Value array = Value::ofArray();
  const Value dictionary = Value::ofDictionary();
  const std::vector<Value> copies{array, dictionary};
  copies[0].array()->push_back("a");
  copies[1].dictionary()->set("a", "1");
  EXPECT_EQ(array.array()->size(), 1U);
  EXPECT_TRUE(dictionary.dictionary()->has("a"));
}

TEST(Value, NewContainersAreTheirOwn) {
  EXPECT_NE(Value::ofArray().array(), Value::ofArray().array());
  EXPECT_TRUE(Value::ofArray().array()->empty());
  EXPECT_TRUE(Value::ofDictionary().dictionary()->empty());
}

TEST(Value, CopiesShareTheBytesOfData) {
  const Value data = Value::ofData({1, 2, 3});
  const std::vector<Value> copies{data, data};
  EXPECT_EQ(copies[0].data(), data.data());
  EXPECT_EQ(copies[1].data(), data.data());
}

TEST(Value, AssignTextLeavesCopiesAlone) {
  Value value = "old";
  const Value copy = value;
  value.assignText("new");
  EXPECT_EQ(*value.string(), "new");
  EXPECT_EQ(*copy.string(), "old");
}

TEST(Value, AssignTextKeepsTheRoomOfALongerText) {
  Value value = std::string(100, 'x');
  const char* room = value.string()->data();
  value.assignText(std::string(50, 'y'));
  EXPECT_EQ(value.string()->data(), room);
  EXPECT_EQ(*value.string(), std::string(50, 'y'));
}

TEST(Value, AssignTextTurnsEveryKindIntoAString) {
  for (Value value : oneOfEach()) {
    value.assignText("new");
    ASSERT_NE(value.string(), nullptr);
    EXPECT_EQ(*value.string(), "new");
  }
}

TEST(Value, AssignTextToASharedContainerLeavesTheContainer) {
  const Value array = Value::ofArray({"a"});
  Value same = array;
  same.assignText("text");
  EXPECT_EQ(array.array()->size(), 1U);
}

TEST(Value, ShallowCopyIsANewContainerOfTheSameElements) {
  const Value inner = Value::ofArray();
  const Value array = Value::ofArray({inner});
  const Value arrayCopy = array.shallowCopy();
  EXPECT_NE(arrayCopy.array(), array.array());
  EXPECT_EQ(arrayCopy.array()->front().array(), inner.array());

  const Value dictionary = Value::ofDictionary();
  dictionary.dictionary()->set("inner", inner);
  const Value dictionaryCopy = dictionary.shallowCopy();
  dictionaryCopy.dictionary()->set("more", "1");
  EXPECT_FALSE(dictionary.dictionary()->has("more"));
  EXPECT_EQ(dictionaryCopy.dictionary()->get("inner").array(), inner.array());
}

TEST(Value, DeepCopySharesNoContainer) {
  const Value inner = Value::ofArray({"a"});
  const Value section = Value::ofDictionary();
  section.dictionary()->set("second", "2");
  section.dictionary()->set("first", inner);
  const Value array = Value::ofArray({section});
  const Value copy = array.deepCopy();
  inner.array()->clear();
  section.dictionary()->set("second", "3");
  array.array()->clear();
  ASSERT_EQ(copy.array()->size(), 1U);
  const Dictionary& entries = *copy.array()->front().dictionary();
  EXPECT_EQ(entries.begin()->key, "second");
  EXPECT_EQ(*entries.get("second").string(), "2");
  EXPECT_EQ(entries.get("first").array()->size(), 1U);
}

TEST(Value, DeepCopyOfAnyOtherKindIsTheValue) {
  EXPECT_TRUE(Value().deepCopy().isAbsent());
  EXPECT_EQ(*Value("text").deepCopy().string(), "text");
  const Value data = Value::ofData({1, 2});
  EXPECT_EQ(data.deepCopy().data(), data.data()) << "data never changes, so it is shared";
}

TEST(Value, ShallowCopyOfAnyOtherKindIsTheValue) {
  EXPECT_TRUE(Value().shallowCopy().isAbsent());
  EXPECT_EQ(*Value("text").shallowCopy().string(), "text");
  EXPECT_EQ(Value::ofInteger(3).shallowCopy().integer(), 3);
}
