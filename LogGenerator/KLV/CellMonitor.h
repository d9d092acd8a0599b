#pragma once

#include <optional>
#include <span>
#include <string_view>

#include "LogGenerator/Field.h"
#include "LogGenerator/Packet.h"
#include "LogGenerator/Section.h"
#include "base/Dictionary.h"
#include "base/Value.h"

namespace varnel {

/// The log code of the telephony server's cell-monitor arrays: a packet header, then a property list. Its
/// root is an array of dictionaries.
inline constexpr std::uint32_t cellMonitorLogCode = 0xFF0001;

/// The records of a cell-monitor packet, as they are in the list. If the payload is no property list, or no
/// array, logs "Cell Info Array data could not be constructed" and returns nothing.
std::optional<Value> readCellMonitorArray(const Packet& packet);

/// Reads cell-monitor packets for several decoders of one index. All of them get the same packet in turn, and
/// it is parsed only once.
class CellMonitorReader {
 public:
  /// Like `readCellMonitorArray`, including the log line. The array is valid until another packet is read;
  /// null when there is none.
  const Array* parse(const Packet& packet);
  /// The same. If there is no array, logs "Failed to get Cell Array
  /// " too.
  const Array* read(const Packet& packet);

 private:
  std::optional<Bytes> _payload;  // absent until a packet was read
  std::optional<Value> _records;
};

/// The record as a dictionary, if it has this radio access technology and this cell type; else null.
const Dictionary* cellOfKind(const Value& record, std::string_view radioAccessTechnology,
                             std::string_view cellType);

/// The first record of this kind; null when there is none.
const Dictionary* firstCellOfKind(const Array& records, std::string_view radioAccessTechnology,
                                  std::string_view cellType);

/// One number of a cell-monitor record, and the entry of a section that shows it.
struct CellMonitorEntry {
  std::string_view key;             ///< the key in the record
  std::string_view label;           ///< the key in the section
  std::string_view failureMessage;  ///< logged as an error when the record has no such number
};

/// Shows each number as a signed 32-bit decimal. A missing number leaves its entry as it is.
void showCell(Section& section, const Dictionary& cell, std::span<const CellMonitorEntry> entries);

/// One number of a cell-monitor record in a list section, which shows only 16 bits of it.
struct CellMonitorColumn {
  enum class Width : std::uint8_t {
    Unsigned16,
    Signed16,  ///< 32767 stands for an unknown level and shows an empty text
  };

  std::string_view key;             ///< the key in the cell-monitor record
  std::string_view label;           ///< the key in the list section's record
  std::string_view failureMessage;  ///< logged as an error when the record has no such number
  Width width;
  Format format = integer();
};

/// Adds one record per cell of this kind, in the order of the cells. Leaves out a number that a cell lacks.
void addCells(Array& list, const Array& cells, std::string_view radioAccessTechnology,
              std::string_view cellType, std::span<const CellMonitorColumn> columns);

}  // namespace varnel
