#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "base/Dictionary.h"
#include "base/Time.h"

namespace varnel {

/// An entry that packets write again and again. It remembers the last position of its key, so that finding
/// the key again takes one comparison. It works with every dictionary.
class BoundEntry {
 public:
  explicit BoundEntry(std::string_view key) : _key(key) {}

  const std::string& key() const { return _key; }
  /// When a packet last wrote it; absent when none did. The writer sets it.
  std::optional<Time> writtenAt;

  /// The value; the absent value when there is none.
  const Value& get(const Dictionary& entries) {
    return find(entries) ? entries.at(_position) : entries.get(_key);
  }
  /// Setting the absent value changes nothing.
  void set(Dictionary& entries, Value&& value) {
    if (find(entries)) {
      if (!value.isAbsent()) entries.at(_position) = std::move(value);
    } else {
      entries.set(_key, std::move(value));
    }
  }
  void setInteger(Dictionary& entries, std::int64_t number) {
    if (find(entries)) {
      entries.at(_position).assignInteger(number);
    } else {
      entries.set(_key, Value::ofInteger(number));
    }
  }
  void setText(Dictionary& entries, std::string_view text) {
    if (find(entries)) {
      entries.at(_position).assignText(text);
    } else {
      entries.setText(_key, text);
    }
  }

 private:
  bool find(const Dictionary& entries) {
    if (entries.hasAt(_position, _key)) return true;
    _position = entries.find(_key);
    return _position != Dictionary::nowhere;
  }

  std::string _key;
  std::size_t _position = 0;
};

}  // namespace varnel
