#include "platform/Dictionary.h"

namespace varnel {

const Value& Dictionary::get(std::string_view key) const {
  static const Value absent;
  const std::size_t position = find(key);
  return position == nowhere ? absent : _entries[position].value;
}

void Dictionary::set(std::string_view key, Value value) {
  if (value.isAbsent()) return;
  const std::size_t position = find(key);
  (position == nowhere ? append(key) : _entries[position].value) = std::move(value);
}

void Dictionary::setText(std::string_view key, std::string_view text) {
  const std::size_t position = find(key);
  (position == nowhere ? append(key) : _entries[position].value).assignText(text);
}

void Dictionary::remove(std::string_view key) {
  const std::size_t position = find(key);
  if (position == nowhere) return;
  _entries.erase(_entries.begin() + static_cast<std::ptrdiff_t>(position));
  _next = 0;
  if (!_positions.empty()) indexAll();
}

std::size_t Dictionary::find(std::string_view key) const {
  if (_next >= _entries.size()) _next = 0;
  if (!_entries.empty() && _entries[_next].key == key) return _next++;
  if (!_positions.empty()) {
    const auto found = _positions.find(std::string(key));
    return found == _positions.end() ? nowhere : found->second;
  }
  for (std::size_t position = 0; position < _entries.size(); ++position) {
    if (_entries[position].key == key) {
      _next = position + 1;
      return position;
    }
  }
  return nowhere;
}

Value& Dictionary::append(std::string_view key) {
  _entries.push_back({std::string(key), Value()});
  if (!_positions.empty()) {
    _positions.emplace(key, _entries.size() - 1);
  } else if (_entries.size() > largestUnindexed) {
    indexAll();
  }
  return _entries.back().value;
}

void Dictionary::indexAll() {
  _positions.clear();
  if (_entries.size() <= largestUnindexed) return;
  for (std::size_t position = 0; position < _entries.size(); ++position) {
    _positions.emplace(_entries[position].key, position);
  }
}

}  // namespace varnel
