#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string_view>
#include <utility>
#include <vector>

#include "LogGenerator/ArrayLock.h"
#include "LogGenerator/BoundEntry.h"
#include "LogGenerator/Field.h"
#include "base/Time.h"
#include "base/Value.h"

namespace varnel {

/// What a decoder writes to: its section of the display. This is a dictionary of entries, or for a list
/// section an array of records. Without a container, or with one of the other kind, what is written is
/// lost.
class Section {
 public:
  /// Sets the container to write to from now on.
  void bind(const Value& container);
  const Value& container() const { return _container; }
  bool holds(const Dictionary& container) const { return _container.dictionary() == &container; }
  bool holds(const Array& container) const { return _container.array() == &container; }

  /// Sets the time of the packets that are decoded from now on.
  void setTime(const Time& now) { _now = now; }
  const Time& time() const { return _now; }
  /// When a packet last wrote the entry; absent when none did.
  std::optional<Time> writtenAt(std::string_view entry) const;
  /// When a packet last refilled the list; absent when none did.
  const std::optional<Time>& refilledAt() const { return _refilledAt; }

  /// Shows the fields, in the order of the table. The table must outlive the section.
  void show(const Packet& packet, std::span<const Field> fields);
  void setText(std::string_view entry, std::string_view text);
  /// Shows a computed number, in an integer format or in a real one.
  void setInteger(std::string_view entry, const Format& format, std::int32_t number);
  void setReal(std::string_view entry, const Format& format, double number);
  /// Setting the absent value changes nothing.
  void set(std::string_view entry, Value value);
  void remove(std::string_view entry);

  /// Empties the list and calls `build(Array&)` to fill it, both under the array lock.
  template <class Build>
  void refill(Build build) {
    Array unseen;
    Array* const list = _container.array();
    const ArrayLock::Scope lock;
    if (list) list->clear();
    build(list ? *list : unseen);
    _refilledAt = _now;
  }

 private:
  // A field table, and the entry for each of its fields.
  struct Table {
    const Field* fields;
    std::vector<std::size_t> entries;
  };

  std::size_t indexOf(std::string_view label);
  // The entry that is about to be written.
  BoundEntry& writtenEntry(std::size_t index) {
    _entries[index].writtenAt = _now;
    return _entries[index];
  }
  const std::vector<std::size_t>& entriesOf(std::span<const Field> fields);

  Value _container;
  Time _now;
  std::vector<BoundEntry> _entries;
  std::size_t _next = 0;  // the entry after the one that was looked for last
  std::vector<Table> _tables;
  std::optional<Time> _refilledAt;
};

}  // namespace varnel
