#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

namespace varnel {

/// A value of JSON as merge patches see it: an object's members, or the text of anything else. Names are
/// strings of JSON, as `jsonString` makes them.
class JsonValue {
 public:
  using Member = std::pair<std::string, JsonValue>;

  static JsonValue ofText(std::string text);
  static JsonValue ofObject() { return {}; }

  bool isObject() const { return _isObject; }
  /// Those of an object, in the order in which they were first set.
  const std::vector<Member>& members() const { return _members; }
  /// Null when there is no such member.
  const JsonValue* member(const std::string& name) const;
  /// Setting a member again keeps its place.
  JsonValue& setMember(const std::string& name, JsonValue value);
  /// The member, as an object that is there from now on unless there is a member of that name.
  JsonValue& objectAt(const std::string& name);

  /// Appends the value as JSON without blanks.
  void appendTo(std::string& json) const;
  std::string text() const;

 private:
  JsonValue() = default;

  bool _isObject = true;
  std::string _text;
  std::vector<Member> _members;
  std::unordered_map<std::string, std::size_t> _places;  // among the members
};

/// What makes the one value the other (RFC 7396): of objects the members that differ, null for those that are
/// gone; anything else, arrays among them, whole. Nothing when the values are equal; members in another order
/// are. No object in the values may have a member null. Takes time that grows with their size alone.
std::optional<JsonValue> mergePatch(const JsonValue& before, const JsonValue& after);

}  // namespace varnel
