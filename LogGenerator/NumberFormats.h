#pragma once

#include <map>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "LogGenerator/Field.h"

namespace varnel {

/// How the entries of a display write their numbers, as their decoders say. What is shown of a value, its
/// number and its unit, is told apart by this alone and not by what a value looks like.
class NumberFormats {
 public:
  /// Adds a format of an entry of that section. An entry may have several. Formats that mostly show texts of
  /// a table are passed over.
  void add(std::string_view section, std::string_view entry, const Format& format);

  /// The unit of the values under a path, as "dBm". Empty when their formats name none, or different ones.
  std::string_view unit(std::span<const std::string> path) const;

  /// The number that a value under that path shows: decimal, without a leading plus. Empty when the value is
  /// no number: another text, one that is not finite, or a row of digits that is longer than a 32-bit number.
  std::string_view number(std::span<const std::string> path, std::string_view value) const;

 private:
  struct Surroundings {
    std::string_view before, after;  // texts around the number; formats live as long as the program
    std::string_view unit() const;
  };
  const std::vector<Surroundings>* find(std::span<const std::string> path) const;

  std::map<std::pair<std::string, std::string>, std::vector<Surroundings>> _entries;  // by section and entry
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
