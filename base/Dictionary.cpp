#include "base/Dictionary.h"

namespace varnel {

constinit const Value Dictionary::absentValue;

const Value& Dictionary::get(std::string_view key) const { return at(find(key)); }

void Dictionary::set(std::string_view key, Value value) { setAt(find(key), key, std::move(value)); }

void Dictionary::setText(std::string_view key, std::string_view text) { setTextAt(find(key), key, text); }

void Dictionary::setAt(std::size_t position, std::string_view key, Value&& value) {
  if (value.isAbsent()) return;
  if (position == nowhere) {
    append(key, std::move(value));
  } else {
    _entries[position].value = std::move(value);
  }
}

void Dictionary::remove(std::string_view key) {
  const std::size_t position = find(key);
  if (position == nowhere) return;
  _entries.erase(_entries.begin() + static_cast<std::ptrdiff_t>(position));
  _next = 0;
  if (!_positions.empty()) indexAll();
}

std::size_t Dictionary::find(std::string_view key) const {
  if (_entries.empty()) return nowhere;
  if (_next > 0 && _next <= _entries.size() && _entries[_next - 1].key == key) return _next - 1;
  if (_next >= _entries.size()) _next = 0;
  if (_entries[_next].key == key) return _next++;
  if ((_kinds & kindOf(key)) == 0) return nowhere;
  if (!_positions.empty()) {
    const auto found = _positions.find(key);
    if (found == _positions.end()) return nowhere;
    _next = found->second + 1;
    return found->second;
  }
  for (std::size_t position = 0; position < _entries.size(); ++position) {
    const std::string& candidate = _entries[position].key;
    // Lengths and ends tell most keys apart, which begin alike.
    if (candidate.size() != key.size() || (!key.empty() && candidate.back() != key.back())) continue;
    if (candidate == key) {
      _next = position + 1;
      return position;
    }
  }
  return nowhere;
}

Dictionary::Rewriting::~Rewriting() {
  std::vector<Entry>& entries = _dictionary._entries;
  entries.erase(entries.begin() + static_cast<std::ptrdiff_t>(_size), entries.end());
  _dictionary._next = 0;
  _dictionary.indexAll();
}

void Dictionary::Rewriting::add(std::string_view key, std::string_view text) {
  std::vector<Entry>& entries = _dictionary._entries;
  _dictionary._kinds |= kindOf(key);
  if (_size == entries.size()) {
    entries.emplace_back(key, text);
  } else {
    entries[_size].key.assign(key);
    entries[_size].value.assignText(text);
  }
  ++_size;
}

// The key may be a view of what stands in the dictionary, which moves when it grows.
void Dictionary::append(std::string_view key, Value&& value) {
  _kinds |= kindOf(key);
  _entries.emplace_back(key, std::move(value));
  if (!_positions.empty()) {
    _positions.emplace(_entries.back().key, _entries.size() - 1);
  } else if (_entries.size() > largestUnindexed) {
    indexAll();
  }
}

void Dictionary::indexAll() {
  _positions.clear();
  if (_entries.size() <= largestUnindexed) return;
  for (std::size_t position = 0; position < _entries.size(); ++position) {
    _positions.emplace(_entries[position].key, position);
  }
}

}  // namespace varnel
