#pragma once

#include <cstdio>
#include <sstream>
#include <string>
#include <string_view>

#include "base/Bytes.h"
#include "base/Dictionary.h"
#include "base/Value.h"

namespace varnel {

/// Bytes as <01ff>.
inline std::string described(ByteView bytes) {
  std::string text = "<";
  for (const std::uint8_t byte : bytes) {
    char digits[3];
    std::snprintf(digits, sizeof digits, "%02x", byte);
    text += digits;
  }
  return text + ">";
}

inline std::string quoted(std::string_view string) {
  std::string text = "\"";
  for (const char character : string) {
    if (character == '"' || character == '\\') text += '\\';
    text += character;
  }
  return text + "\"";
}

inline std::string described(const Dictionary& dictionary);
inline std::string described(const Array& array);

/// A value in one line that tells its kinds and orders apart: {A: "x", L: ["1", 2, 2.5, true, <01ff>]}. The
/// absent value is the word absent.
inline std::string described(const Value& value) {
  std::ostringstream text;
  text << std::boolalpha;
  switch (value.kind()) {
    case Value::Kind::Absent:
      text << "absent";
      break;
    case Value::Kind::String:
      text << quoted(*value.string());
      break;
    case Value::Kind::Integer:
      text << *value.integer();
      break;
    case Value::Kind::Real:
      text << std::showpoint << *value.real();
      break;
    case Value::Kind::Boolean:
      text << *value.boolean();
      break;
    case Value::Kind::Date:
      text << "date " << value.date()->seconds << "s " << value.date()->microseconds << "us";
      break;
    case Value::Kind::Data:
      text << described(*value.data());
      break;
    case Value::Kind::Array:
      text << described(*value.array());
      break;
    case Value::Kind::Dictionary:
      text << described(*value.dictionary());
      break;
  }
  return text.str();
}

inline std::string described(const Dictionary& dictionary) {
  std::string text;
  for (const auto& [key, value] : dictionary) {
    text += (text.empty() ? "" : ", ") + key + ": " + described(value);
  }
  return "{" + text + "}";
}

inline std::string described(const Array& array) {
  std::string text;
  for (const Value& element : array) text += (text.empty() ? "" : ", ") + described(element);
  return "[" + text + "]";
}

}  // namespace varnel
