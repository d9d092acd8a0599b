#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "base/Value.h"

namespace varnel {

/// String keys in the order in which they were first set. Setting a key again keeps its place; a key that was
/// removed and is set again goes to the end. No key ever holds the absent value.
class Dictionary {
 public:
  struct Entry {
    Entry(std::string_view itsKey, Value&& itsValue) : key(itsKey), value(std::move(itsValue)) {}
    Entry(std::string_view itsKey, const Value& itsValue) : key(itsKey), value(itsValue) {}

    std::string key;
    Value value;
  };

  /// A key that remembers where it was found last. It fits every dictionary.
  class Slot {
   public:
    explicit Slot(std::string_view key) : _key(key) {}

   private:
    friend class Dictionary;
    std::string _key;
    std::size_t _position = 0;
  };

  /// Fills a dictionary anew, in the room of what stands in it. The rows are those that are added, once this
  /// is gone; what is found in the dictionary before then is of no meaning.
  class Rewriting {
   public:
    explicit Rewriting(Dictionary& dictionary) : _dictionary(dictionary) {}
    Rewriting(const Rewriting&) = delete;
    Rewriting& operator=(const Rewriting&) = delete;
    ~Rewriting();

    /// Adds a row. No other one may have the key.
    void add(std::string_view key, std::string_view text);

   private:
    Dictionary& _dictionary;
    std::size_t _size = 0;
  };

  /// The key's value; the absent value when there is no such key.
  const Value& get(std::string_view key) const;
  bool has(std::string_view key) const { return find(key) != nowhere; }

  /// Setting the absent value changes nothing.
  void set(std::string_view key, Value value);
  /// Sets a text. Where a text stands already its room is used again, so rewriting rows of a like length
  /// allocates nothing.
  void setText(std::string_view key, std::string_view text);
  /// The same for whoever comes with the same key over and over.
  const Value& get(Slot& slot) const { return at(find(slot)); }
  void set(Slot& slot, Value value) { setAt(find(slot), slot._key, std::move(value)); }
  void remove(const Slot& slot) { remove(slot._key); }
  void setText(Slot& slot, std::string_view text) { setTextAt(find(slot), slot._key, text); }
  void remove(std::string_view key);
  /// Makes room for that many keys at once.
  void reserve(std::size_t size) { _entries.reserve(size); }

  std::size_t size() const { return _entries.size(); }
  bool empty() const { return _entries.empty(); }
  std::vector<Entry>::const_iterator begin() const { return _entries.begin(); }
  std::vector<Entry>::const_iterator end() const { return _entries.end(); }

 private:
  static const Value absentValue;
  static constexpr std::size_t nowhere = static_cast<std::size_t>(-1);
  // Up to here a walk over the entries beats an index.
  static constexpr std::size_t largestUnindexed = 48;

  // One of 64 kinds of keys, as a bit.
  static std::uint64_t kindOf(std::string_view key) {
    const std::size_t last = key.empty() ? 0 : static_cast<unsigned char>(key.back());
    return std::uint64_t{1} << ((key.size() * 5 + last) % 64);
  }

  std::size_t find(std::string_view key) const;
  std::size_t find(Slot& slot) const {
    const std::size_t position = slot._position;
    if (position < _entries.size() && _entries[position].key == slot._key) return position;
    return slot._position = find(slot._key);
  }
  const Value& at(std::size_t position) const {
    return position == nowhere ? absentValue : _entries[position].value;
  }
  void setAt(std::size_t position, std::string_view key, Value&& value);
  void setTextAt(std::size_t position, std::string_view key, std::string_view text) {
    if (position == nowhere) {
      append(key, text);
    } else {
      _entries[position].value.assignText(text);
    }
  }
  void append(std::string_view key, Value&& value);
  void indexAll();

  std::vector<Entry> _entries;
  // Where each key stands; empty as long as the dictionary is small.
  std::map<std::string, std::size_t, std::less<>> _positions;
  // A packet sets its rows in the same order each time, so the next key is looked for behind the last one.
  mutable std::size_t _next = 0;
  // The kinds of the keys that have ever stood here. A key of another kind need not be looked for.
  std::uint64_t _kinds = 0;
};

}  // namespace varnel
