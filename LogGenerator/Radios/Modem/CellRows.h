#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "LogGenerator/Field.h"
#include "LogGenerator/NumberFormats.h"
#include "base/Dictionary.h"
#include "base/Value.h"

namespace varnel::modem {

/// One entry that shows something of a cell in a modem report.
struct CellRow {
  enum class Kind : std::uint8_t {
    Network,  ///< the code of the network, from two kinds of digits
    Whole,    ///< a whole number between the limits
    Level,    ///< a number between the limits, in the row's format
  };

  std::string_view label;
  Kind kind;
  std::string_view key{};  ///< in the report
  std::int64_t least = 0, most = 0;
  /// Turns a whole number into the text; null for a plain decimal number.
  std::string (*text)(std::int64_t number) = nullptr;
  /// Of a level; of a whole number that has a unit in its text. Null where there is no unit.
  const Format* format = nullptr;
};

/// What the display shows of the cells of one radio.
struct Radio {
  std::string_view name;         ///< as the reports call it
  std::string_view sectionName;  ///< of its serving cell
  std::span<const CellRow> rows;
};

/// All radios that a report can tell about.
std::span<const Radio> radios();

/// The text of an entry. Empty when the cell does not tell it, or tells something impossible.
std::string textOf(const Dictionary& cell, const CellRow& row, Formatter& formatter);
void listFormats(const Radio& radio, SectionFormats& formats);

/// Calls `take(radio, cell)` for the cells of a report, in their order. Leaves out records of another kind,
/// and what is past the limit of cells.
template <class Take>
void forEachCell(const Dictionary& report, Take take);

/// The first serving cell of the radio; null when there is none.
const Dictionary* servingCellIn(const Dictionary& report, const Radio& radio);
/// Whether a cell serves the modem.
bool isServing(const Dictionary& cell);

// ---- Implementation ----

/// The cells of a report, and the radio of a cell; null when there is none.
std::span<const Value> cellsIn(const Dictionary& report);
const Radio* radioOf(const Dictionary& cell);

template <class Take>
void forEachCell(const Dictionary& report, Take take) {
  for (const Value& record : cellsIn(report)) {
    const Dictionary* const cell = record.dictionary();
    if (const Radio* const radio = cell ? radioOf(*cell) : nullptr) take(*radio, *cell);
  }
}

}  // namespace varnel::modem
