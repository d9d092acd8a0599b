#include "programs/varnel-decode/MergePatch.h"

namespace varnel {

JsonValue JsonValue::ofText(std::string text) {
  JsonValue value;
  value._isObject = false;
  value._text = std::move(text);
  return value;
}

const JsonValue* JsonValue::member(const std::string& name) const {
  const auto place = _places.find(name);
  return place == _places.end() ? nullptr : &_members[place->second].second;
}

JsonValue& JsonValue::setMember(const std::string& name, JsonValue value) {
  const auto [place, isNew] = _places.try_emplace(name, _members.size());
  if (isNew) return _members.emplace_back(name, std::move(value)).second;
  return _members[place->second].second = std::move(value);
}

JsonValue& JsonValue::objectAt(const std::string& name) {
  const auto place = _places.find(name);
  return place == _places.end() ? setMember(name, ofObject()) : _members[place->second].second;
}

void JsonValue::appendTo(std::string& json) const {
  if (!_isObject) {
    json += _text;
    return;
  }
  char separator = '{';
  for (const auto& [name, value] : _members) {
    json += separator;
    separator = ',';
    json += name;
    json += ':';
    value.appendTo(json);
  }
  json += _members.empty() ? "{}" : "}";
}

std::string JsonValue::text() const {
  std::string json;
  appendTo(json);
  return json;
}

std::optional<JsonValue> mergePatch(const JsonValue& before, const JsonValue& after) {
  if (!before.isObject() || !after.isObject()) {
    if (before.isObject() == after.isObject() && before.text() == after.text()) return std::nullopt;
    return after;
  }
  JsonValue patch = JsonValue::ofObject();
  for (const auto& [name, value] : after.members()) {
    const JsonValue* const old = before.member(name);
    if (auto difference = old ? mergePatch(*old, value) : value)
      patch.setMember(name, *std::move(difference));
  }
  for (const auto& [name, value] : before.members()) {
    if (!after.member(name)) patch.setMember(name, JsonValue::ofText("null"));
  }
  if (patch.members().empty()) return std::nullopt;
  return patch;
}

}  // namespace varnel
