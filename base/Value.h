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

/// A moment in a property list, counted from 2001-01-01 00:00:00 UTC.
struct Date {
  std::int32_t seconds = 0;
  std::int32_t microseconds = 0;
};

/// One property-list value. A copy of an array or a dictionary refers to the same container. All other kinds
/// are immutable and are copied (copies of data share the bytes).
class Value {
 public:
  enum class Kind { Absent, String, Integer, Real, Boolean, Date, Data, Array, Dictionary };

  /// The absent value.
  Value() = default;
  Value(std::string text) : _content(std::move(text)) {}
  Value(std::string_view text) : _content(std::string(text)) {}
  Value(const char* text) : _content(std::string(text)) {}
  /// A null reference becomes the absent value.
  Value(ArrayRef array);
  Value(DictionaryRef dictionary);

  static Value ofInteger(std::int64_t number) { return Value(Content(number)); }
  static Value ofReal(double number) { return Value(Content(number)); }
  static Value ofBoolean(bool truth) { return Value(Content(truth)); }
  static Value ofDate(Date moment) { return Value(Content(moment)); }
  static Value ofData(Bytes bytes) { return Value(Content(std::make_shared<const Bytes>(std::move(bytes)))); }
  /// A new array; a new empty dictionary.
  static Value ofArray(Array elements = {}) { return Value(std::make_shared<Array>(std::move(elements))); }
  static Value ofDictionary();

  Kind kind() const { return static_cast<Kind>(_content.index()); }
  bool isAbsent() const { return kind() == Kind::Absent; }

  /// For a value of another kind, the accessors yield nothing: a null pointer or an empty optional.
  const std::string* string() const { return std::get_if<std::string>(&_content); }
  std::optional<std::int64_t> integer() const { return number<std::int64_t>(); }
  std::optional<double> real() const { return number<double>(); }
  std::optional<bool> boolean() const { return number<bool>(); }
  std::optional<Date> date() const { return number<Date>(); }
  const Bytes* data() const;
  /// The container itself. All values that share the container see a change.
  Array* array() const;
  Dictionary* dictionary() const;
  /// Whether another value refers to the same dictionary; false for any other kind.
  bool sharesDictionary() const;

  /// The number as a signed 32-bit integer. Integers wrap. Reals are truncated toward zero and wrap; a real
  /// that is not finite becomes 0. Nothing for any other kind; a boolean is no number.
  std::optional<std::int32_t> int32() const;

  /// Becomes the given text. Reuses the memory of a text that was there.
  void assignText(std::string_view text);
  /// Becomes the given integer.
  void assignInteger(std::int64_t number) { _content = number; }

  /// For an array or a dictionary, a new one that shares its elements with this one; any other value itself.
  Value shallowCopy() const;
  /// A copy that shares no container. The value must not contain itself.
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
