#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "base/Value.h"

namespace varnel {

/// Values by string keys, in the order in which the keys were first set. Setting a key again keeps its place.
/// A key that was removed and is set again goes to the end. No key has the absent value.
class Dictionary {
 public:
  struct Entry {
    Entry(std::string_view itsKey, Value&& itsValue) : key(itsKey), value(std::move(itsValue)) {}
    Entry(std::string_view itsKey, const Value& itsValue) : key(itsKey), value(itsValue) {}

    std::string key;
    Value value;
  };

  /// The position of a missing key.
  static constexpr std::size_t nowhere = static_cast<std::size_t>(-1);

  /// The key's value; the absent value when there is no such key.
  const Value& get(std::string_view key) const;
  bool has(std::string_view key) const { return find(key) != nowhere; }

  /// Setting the absent value changes nothing.
  void set(std::string_view key, Value value);
  /// Sets a text. Reuses the memory of an old text, so writing entries of similar length again allocates
  /// nothing.
  void setText(std::string_view key, std::string_view text);
  void remove(std::string_view key);
  /// Adds an entry at the end. The key must not be in the dictionary, and the value not be absent.
  void add(std::string_view key, Value value);
  /// Makes the entry at this position, at most the size, this key with a text. No entry before it may have
  /// the key. An entry that has the key keeps its memory; else the entries from the position on are removed.
  void writeAt(std::size_t position, std::string_view key, std::string_view text);
  /// Removes the entries from this position on.
  void truncate(std::size_t size);
  /// Reserves memory for this many keys.
  void reserve(std::size_t size) { _entries.reserve(size); }

  /// The position of the key; `nowhere` when it is missing. A position is valid until an
  /// entry is removed.
  std::size_t find(std::string_view key) const;
  /// Whether the key is at this position.
  bool hasAt(std::size_t position, std::string_view key) const {
    return position < _entries.size() && _entries[position].key == key;
  }
  const Value& at(std::size_t position) const { return _entries[position].value; }
  /// The value at this position, for changing it. It must not become the absent value.
  Value& at(std::size_t position) { return _entries[position].value; }

  std::size_t size() const { return _entries.size(); }
  bool empty() const { return _entries.empty(); }
  std::vector<Entry>::const_iterator begin() const { return _entries.begin(); }
  std::vector<Entry>::const_iterator end() const { return _entries.end(); }

 private:
  static const Value absentValue;
  // Up to this size, a search through the entries is faster than an index.
  static constexpr std::size_t largestUnindexed = 48;

  struct Hash {
    using is_transparent = void;
    std::size_t operator()(std::string_view key) const { return std::hash<std::string_view>()(key); }
  };

  void indexAll();

  std::vector<Entry> _entries;
  // The position of each key; empty while the dictionary is small, like those of a display.
  std::unordered_map<std::string, std::size_t, Hash, std::equal_to<>> _positions;
};

}  // namespace varnel
