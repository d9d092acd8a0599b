#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

namespace varnel {

/// A JSON value as a merge patch sees it: the members of an object, or the JSON text of anything else. Names
/// are JSON strings, as `jsonString` makes them.
class JsonValue {
 public:
  using Member = std::pair<std::string, JsonValue>;

  static JsonValue ofText(std::string text);
  static JsonValue ofObject() { return {}; }

  bool isObject() const { return _isObject; }
  /// The members of an object, in the order in which they were first set.
  const std::vector<Member>& members() const { return _members; }
  /// Null when there is no such member.
  const JsonValue* member(const std::string& name) const;
  /// Setting a member again keeps its place.
  JsonValue& setMember(const std::string& name, JsonValue value);
  /// The member. If there is none, adds an empty object under this name.
  JsonValue& objectAt(const std::string& name);

  /// Appends the value as JSON without blanks.
  void appendTo(std::string& json) const;
  std::string text() const;

 private:
  JsonValue() = default;

  bool _isObject = true;
  std::string _text;
  std::vector<Member> _members;
  std::unordered_map<std::string, std::size_t> _places;  // the index of each member by its name
};

/// What turns `before` into `after` (RFC 7396): of objects the members that differ, and null for those that
/// are gone; anything else, including arrays, whole. Nothing when the values are equal; the order of members
/// does not matter. No object in the values may have a null member. Takes time in proportion to their size.
std::optional<JsonValue> mergePatch(const JsonValue& before, const JsonValue& after);

}  // namespace varnel
