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

/// How one entry of a display writes its numbers. It is a view of the formats that it comes from, and knows
/// none where those do not.
class EntryFormats {
 public:
  /// Texts around a number; formats live as long as the program.
  struct Surroundings {
    std::string_view before, after;
    std::string_view unit() const;
  };

  EntryFormats() = default;
  explicit EntryFormats(const std::vector<Surroundings>& formats) : _formats(&formats) {}
  bool areKnown() const { return _formats != nullptr; }

  /// The unit of the values, as "dBm". Empty when their formats name none, or different ones.
  std::string_view unit() const;

  /// The number that a value shows: decimal, without a leading plus. Empty when the value is no number:
  /// another text, one that is not finite, or a row of digits that is longer than a 32-bit number.
  std::string_view number(std::string_view value) const;

 private:
  const std::vector<Surroundings>* _formats = nullptr;
};

/// Where the entry stands that a path leads to.
struct EntryPlace {
  EntryFormats formats;
  /// How many names of the path lead to the entry; what follows them stands in it, as a pilot in a list of
  /// pilots. 0 when there are no formats.
  std::size_t depth = 0;
};

/// How the entries of a display write their numbers, as their decoders say. What is shown of a value, its
/// number and its unit, is told apart by this alone and not by what a value looks like.
class NumberFormats {
 public:
  /// Adds a format of an entry of that section. An entry may have several. Formats that mostly show texts of
  /// a table are passed over.
  void add(std::string_view section, std::string_view entry, const Format& format);
  /// Adds all formats of others.
  void add(const NumberFormats& others);

  /// The formats of what stands under a path. Valid while these are not added to.
  EntryPlace at(std::span<const std::string> path) const;
  /// The same of a path as users write it, names and slashes, which may select records of lists in brackets.
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

/// The formats of one section, for its decoder to add to.
class SectionFormats {
 public:
  SectionFormats(NumberFormats& formats, std::string_view section) : _formats(formats), _section(section) {}

  void add(std::string_view entry, const Format& format) { _formats.add(_section, entry, format); }
  /// Adds each row of a table, of fields or of cell-monitor columns.
  template <class Row>
  void add(std::span<const Row> table) {
    for (const Row& row : table) add(row.label, row.format);
  }
  template <class Row, std::size_t size>
  void add(const Row (&table)[size]) {
    add(std::span<const Row>(table));
  }

 private:
  NumberFormats& _formats;
  std::string_view _section;
};

}  // namespace varnel
