#include "base/Dictionary.h"

namespace varnel {

constinit const Value Dictionary::absentValue;

const Value& Dictionary::get(std::string_view key) const {
  const std::size_t position = find(key);
  return position == nowhere ? absentValue : _entries[position].value;
}

void Dictionary::set(std::string_view key, Value value) {
  if (value.isAbsent()) return;
  const std::size_t position = find(key);
  if (position == nowhere) {
    add(key, std::move(value));
  } else {
    at(position) = std::move(value);
  }
}

void Dictionary::setText(std::string_view key, std::string_view text) {
  const std::size_t position = find(key);
  if (position == nowhere) {
    add(key, text);
  } else {
    at(position).assignText(text);
  }
}

// The key may be a view of a text in the dictionary, which moves when the dictionary grows.
void Dictionary::add(std::string_view key, Value value) {
  _entries.emplace_back(key, std::move(value));
  if (!_positions.empty()) {
    _positions.emplace(_entries.back().key, _entries.size() - 1);
  } else if (_entries.size() > largestUnindexed) {
    indexAll();
  }
}

void Dictionary::remove(std::string_view key) {
  const std::size_t position = find(key);
  if (position == nowhere) return;
  _entries.erase(_entries.begin() + static_cast<std::ptrdiff_t>(position));
  if (!_positions.empty()) indexAll();
}

void Dictionary::writeAt(std::size_t position, std::string_view key, std::string_view text) {
  if (hasAt(position, key)) {
    at(position).assignText(text);
  } else {
    truncate(position);
    add(key, text);
  }
}

void Dictionary::truncate(std::size_t size) {
  if (size >= _entries.size()) return;
  _entries.erase(_entries.begin() + static_cast<std::ptrdiff_t>(size), _entries.end());
  if (!_positions.empty()) indexAll();
}

std::size_t Dictionary::find(std::string_view key) const {
  if (!_positions.empty()) {
    const auto found = _positions.find(key);
    return found == _positions.end() ? nowhere : found->second;
  }
  for (std::size_t position = 0; position < _entries.size(); ++position) {
    if (_entries[position].key == key) return position;
  }
  return nowhere;
}

void Dictionary::indexAll() {
  _positions.clear();
  if (_entries.size() <= largestUnindexed) return;
  for (std::size_t position = 0; position < _entries.size(); ++position) {
    _positions.emplace(_entries[position].key, position);
  }
}

}  // namespace varnel
