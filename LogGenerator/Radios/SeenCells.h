#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/Section.h"
#include "base/Dictionary.h"
#include "base/Time.h"
#include "base/Value.h"

namespace varnel {

/// Which cell a record is about, and its place in the list: smaller ranks come first, then smaller keys.
struct CellPlace {
  double rank;
  std::uint64_t key;

  bool operator<(const CellPlace& other) const {
    return rank != other.rank ? rank < other.rank : key < other.key;
  }
};

/// The list of a section's entry "Cells": a record per cell, until the cell was not seen for a while. The
/// list has room for some cells; when there are more, the last ones go.
///
/// The records are changed where they are, and the list is made anew only when cells come, go, or change
/// their places.
class SeenCells {
 public:
  static constexpr std::string_view listEntry = "Cells", lastSeenEntry = "Last Seen";
  static constexpr std::size_t capacity = 64;
  /// A cell goes when it was not seen for so long.
  static constexpr std::chrono::seconds lifetime{30};

  /// Reads from a record of an earlier generator what the record is about. Nothing for one that is of no use.
  using ReadPlace = std::optional<CellPlace> (*)(const Dictionary& record);
  explicit SeenCells(ReadPlace readPlace) : _readPlace(readPlace) {}

  /// It is so late: removes the cells that must go. A section that already has cells, from an earlier
  /// generator, keeps them as seen at the section's time, or now if it has none yet.
  void begin(Section& section, const Time& now);
  /// A cell is seen: its record, to be written. Null when there is no room for it. Another cell may lose its
  /// record, so write the record before the next call.
  Dictionary* see(const CellPlace& place);
  /// Removes a cell, if the list has it.
  void remove(std::uint64_t key);
  /// The text of the time of `begin`, for the entry "Last Seen".
  std::string_view lastSeen() const { return _nowText; }
  /// Shows the list in the section that `begin` got, if a cell was seen or removed since then.
  void show(Section& section);

 private:
  struct Cell {
    CellPlace place;
    Time lastSeen;
    Value record;
  };

  void adopt(const Section& section);
  void setNow(const Time& now);
  void removeOld();
  Cell* find(std::uint64_t key);
  void makeRoom(const CellPlace& place);
  bool sort();

  const ReadPlace _readPlace;
  Value _container;  // the section's, when its cells were adopted
  std::vector<Cell> _cells;
  Value _list = Value::ofArray();
  bool _isChanged = false;  // a cell was seen or removed
  bool _listIsOld = false;  // cells came or went
  Time _now;
  std::string _nowText;
};

}  // namespace varnel
