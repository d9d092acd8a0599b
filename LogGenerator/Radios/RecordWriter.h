#pragma once

#include <array>
#include <charconv>
#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

#include "LogGenerator/Field.h"
#include "base/Dictionary.h"

namespace varnel {

/// Writes all entries of a record anew, in their order. What the record had before is replaced; a record that
/// had the same entries keeps its memory. Entries that are not written again go when the writer does. Each
/// label may come only once.
class RecordWriter {
 public:
  explicit RecordWriter(Dictionary& record) : _record(record) {}
  RecordWriter(const RecordWriter&) = delete;
  RecordWriter& operator=(const RecordWriter&) = delete;
  ~RecordWriter() { _record.truncate(_next); }

  void put(std::string_view label, std::string_view text) { _record.writeAt(_next++, label, text); }
  /// Writes nothing where there is no text.
  void putUnlessEmpty(std::string_view label, std::string_view text) {
    if (!text.empty()) put(label, text);
  }
  void put(std::string_view label, std::uint32_t number) {
    std::array<char, 10> room;
    const auto end = std::to_chars(room.begin(), room.end(), number).ptr;
    put(label, std::string_view(room.begin(), end));
  }
  /// A computed number in a format made by `integer`.
  void put(std::string_view label, const Format& format, std::int32_t number) {
    put(label, _formatter.text(format, number));
  }
  void put(const Packet& packet, const Field& field) { put(field.label, _formatter.text(packet, field)); }
  void put(const Packet& packet, std::span<const Field> fields) {
    for (const Field& field : fields) put(packet, field);
  }

 private:
  Dictionary& _record;
  std::size_t _next = 0;  // position of the next entry
  Formatter _formatter;
};

}  // namespace varnel
