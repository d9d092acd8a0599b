#pragma once

#include <cstddef>
#include <functional>
#include <map>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/Field.h"

namespace varnel {

/// The formats of one entry of a display. It is a view of the `NumberFormats` from which it comes.
class EntryFormats {
 public:
  /// Texts before and after a number. The formats live as long as the program.
  struct Surroundings {
    std::string_view before, after;
    std::string_view unit() const;
  };

  EntryFormats() = default;
  explicit EntryFormats(const std::vector<Surroundings>& formats) : _formats(&formats) {}
  bool areKnown() const { return _formats != nullptr; }

  /// The unit of the values, such as "dBm". Empty when their formats name no unit, or different ones.
  std::string_view unit() const;

  /// Whether the formats name different units, so that each value may have another one.
  bool haveSeveralUnits() const;
  /// The unit of this value.
  std::string_view unitOf(std::string_view value) const;

  /// The number in a value, in decimal and without a leading plus. Empty when the value is no number: another
  /// text, a number that is not finite, or more digits than a 32-bit number has.
  std::string_view number(std::string_view value) const;

 private:
  const std::vector<Surroundings>* _formats = nullptr;
};

/// The entry to which a path leads.
struct EntryPlace {
  EntryFormats formats;
  /// How many names of the path lead to the entry. The names after them are inside it, like a pilot in a list
  /// of pilots. 0 when there are no formats.
  std::size_t depth = 0;
};

/// The formats of a display's entries, from their decoders. A unit comes from the formats alone, not from the
/// look of a value. A plain decimal number needs no format.
class NumberFormats {
 public:
  /// Adds a format of an entry in this section. An entry may have several formats. Ignores formats that
  /// mostly show texts of a table.
  void add(std::string_view section, std::string_view entry, const Format& format);
  /// Adds all formats of another object.
  void add(const NumberFormats& others);

  /// The formats of the entry at a path. Valid until formats are added to this object.
  EntryPlace at(std::span<const std::string> path) const;
  /// The same for a path as users write it: names with slashes, and selections of records in brackets.
  EntryFormats under(std::string_view path) const;

  std::string_view unit(std::span<const std::string> path) const { return at(path).formats.unit(); }
  std::string_view number(std::span<const std::string> path, std::string_view value) const {
    return at(path).formats.number(value);
  }

 private:
  using Section = std::map<std::string, std::vector<EntryFormats::Surroundings>, std::less<>>;

  static EntryFormats underSection(const Section& entries, std::string_view path);

  std::map<std::string, Section, std::less<>> _sections;
};

/// The formats of one section. Its decoder adds to them.
class SectionFormats {
 public:
  SectionFormats(NumberFormats& formats, std::string_view section) : _formats(formats), _section(section) {}

  void add(std::string_view entry, const Format& format) { _formats.add(_section, entry, format); }
  /// Adds each field of a table, or each cell-monitor column.
  template <class Line>
  void add(std::span<const Line> table) {
    for (const Line& line : table) add(line.label, line.format);
  }
  template <class Line, std::size_t size>
  void add(const Line (&table)[size]) {
    add(std::span<const Line>(table));
  }

 private:
  NumberFormats& _formats;
  std::string_view _section;
};

}  // namespace varnel
