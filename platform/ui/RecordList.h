#pragma once

#include <optional>
#include <string>
#include <vector>

namespace varnel {

/// The records of a list, as a table with columns shows them.
struct RecordList {
  struct Cell {
    std::string text{};              ///< empty where the record has no such entry
    std::optional<double> number{};  ///< absent when the text is no number, with or without a unit
  };
  struct Record {
    std::string name{};         ///< of its row
    std::string identity{};     ///< what it is about; no other record of the list has the same
    std::vector<Cell> cells{};  ///< one per column
  };

  std::vector<std::string> columns{};  ///< the names of the entries that the records have
  std::vector<Record> records{};       ///< in the order of the rows
};

}  // namespace varnel
