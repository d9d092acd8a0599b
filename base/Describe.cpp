#include "base/Describe.h"

#include "base/Dictionary.h"

namespace varnel {

namespace {

std::string quoted(const std::string& text) { return '"' + text + '"'; }

std::string describeEntries(const Dictionary& entries) {
  std::string text = "{";
  for (const auto& [key, value] : entries)
    text.append(key).append(" = ").append(describe(value)).append("; ");
  return text + "}";
}

std::string describeElements(const Array& elements) {
  std::string text = "(";
  for (const Value& element : elements) text.append(text.size() > 1 ? ", " : "").append(describe(element));
  return text + ")";
}

}  // namespace

std::string describe(const Value& value) {
  switch (value.kind()) {
    case Value::Kind::Absent:
      return "(null)";
    case Value::Kind::String:
      return quoted(*value.string());
    case Value::Kind::Integer:
      return std::to_string(*value.integer());
    case Value::Kind::Real:
      return std::to_string(*value.real());
    case Value::Kind::Boolean:
      return *value.boolean() ? "1" : "0";
    case Value::Kind::Date:
      return std::to_string(value.date()->seconds) + " s from 2001";
    case Value::Kind::Data:
      return std::to_string(value.data()->size()) + " bytes";
    case Value::Kind::Array:
      return describeElements(*value.array());
    case Value::Kind::Dictionary:
      return describeEntries(*value.dictionary());
  }
  return {};
}

}  // namespace varnel
