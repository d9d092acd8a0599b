#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "base/Bytes.h"

namespace varnel {

class Dictionary;
class Value;

using Array = std::vector<Value>;
using ArrayRef = std::shared_ptr<Array>;
using DictionaryRef = std::shared_ptr<Dictionary>;
using DataRef = std::shared_ptr<const Bytes>;

/// A moment as property lists keep it, counted from 2001-01-01 00:00:00 UTC.
struct Date {
  std::int32_t seconds = 0;
  std::int32_t microseconds = 0;
};

/// One property-list value. Arrays and dictionaries are shared by reference: a copy of the value is another
/// reference to the same container. All other kinds are immutable and copied (data shares its bytes).
class Value {
 public:
  enum class Kind { Absent, String, Integer, Real, Boolean, Date, Data, Array, Dictionary };

  /// The absent value.
  Value() = default;
  Value(std::string text) : _content(std::move(text)) {}
  Value(std::string_view text) : _content(std::string(text)) {}
  Value(const char* text) : _content(std::string(text)) {}
  /// A null reference makes the absent value.
  Value(ArrayRef array);
  Value(DictionaryRef dictionary);

  static Value ofInteger(std::int64_t number) { return Value(Content(number)); }
  static Value ofReal(double number) { return Value(Content(number)); }
  static Value ofBoolean(bool truth) { return Value(Content(truth)); }
  static Value ofDate(Date moment) { return Value(Content(moment)); }
  static Value ofData(Bytes bytes) { return Value(Content(std::make_shared<const Bytes>(std::move(bytes)))); }
  /// A new array, a new empty dictionary.
  static Value ofArray(Array elements = {}) { return Value(std::make_shared<Array>(std::move(elements))); }
  static Value ofDictionary();

  Kind kind() const { return static_cast<Kind>(_content.index()); }
  bool isAbsent() const { return kind() == Kind::Absent; }

  /// The accessors yield nothing (a null pointer, an empty optional) for a value of another kind.
  const std::string* string() const { return std::get_if<std::string>(&_content); }
  std::optional<std::int64_t> integer() const { return number<std::int64_t>(); }
  std::optional<double> real() const { return number<double>(); }
  std::optional<bool> boolean() const { return number<bool>(); }
  std::optional<Date> date() const { return number<Date>(); }
  const Bytes* data() const;
  /// The container itself, to read and to change: whoever shares it sees the change.
  Array* array() const;
  Dictionary* dictionary() const;
  /// Whether another value has the same dictionary; false for any other kind.
  bool sharesDictionary() const;

  /// The number as a signed 32-bit integer: integers wrap, reals are truncated towards zero and wrap, a real
  /// that is not finite gives 0. Nothing for any other kind; a boolean is no number.
  std::optional<std::int32_t> int32() const;

  /// Becomes the given text. A text that is there already gives its room to the new one.
  void assignText(std::string_view text);

  /// An array or dictionary of its own with the same elements, shared with this one; any other value itself.
  Value shallowCopy() const;
  /// The same value without a container that anybody shares; the containers form no circle.
  Value deepCopy() const;

 private:
  using Content = std::variant<std::monostate, std::string, std::int64_t, double, bool, Date, DataRef,
                               ArrayRef, DictionaryRef>;
  explicit Value(Content content) : _content(std::move(content)) {}

  template <class Number>
  std::optional<Number> number() const {
    const Number* found = std::get_if<Number>(&_content);
    return found ? std::optional<Number>(*found) : std::nullopt;
  }

  Content _content;
};

}  // namespace varnel
