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

/// The log code of the telephony server's cell-monitor arrays: a packet header, then a property list whose
/// root is an array of dictionaries.
inline constexpr std::uint32_t cellMonitorLogCode = 0xFF0001;

/// The records of a cell-monitor packet, as they are in the list. What is no property list, or not an array,
/// gives nothing and logs "Cell Info Array data could not be constructed".
std::optional<Value> readCellMonitorArray(const Packet& packet);

/// Reads cell-monitor packets for several decoders of one index: the packet that all of them get in turn is
/// parsed but once.
class CellMonitorReader {
 public:
  /// Like `readCellMonitorArray`, message included. The array stays until another packet is read; null when
  /// there is none, after the further message "Failed to get Cell Array\n".
  const Array* read(const Packet& packet);

 private:
  std::optional<Bytes> _payload;  // absent until a packet is read
  std::optional<Value> _records;
};

/// The record as a dictionary when it has a radio access technology and a cell type and they are the given
/// ones; else null.
const Dictionary* cellOfKind(const Value& record, std::string_view radioAccessTechnology,
                             std::string_view cellType);

/// The first record of that kind; null when there is none.
const Dictionary* firstCellOfKind(const Array& records, std::string_view radioAccessTechnology,
                                  std::string_view cellType);

/// One number of a cell-monitor record and the entry of a section that shows it.
struct CellMonitorEntry {
  std::string_view key;             ///< the record's key
  std::string_view label;           ///< the section's
  std::string_view failureMessage;  ///< logged as an error when the record has no such number
};

/// Shows each number as a signed 32-bit decimal; one that is missing leaves its entry as it is.
void showCell(Section& section, const Dictionary& cell, std::span<const CellMonitorEntry> entries);

/// One number that a list section shows of a cell-monitor record, which keeps only 16 bits of it.
struct CellMonitorColumn {
  enum class Width : std::uint8_t {
    Unsigned16,
    Signed16,  ///< 32767 stands for a level that is not known and shows an empty text
  };

  std::string_view key;             ///< the record's key
  std::string_view label;           ///< the row's
  std::string_view failureMessage;  ///< logged as an error when the record has no such number
  Width width;
  Format format = integer();
};

/// Adds a record per cell of that kind, in their order. A number that a cell lacks is left out.
void addCells(Array& list, const Array& cells, std::string_view radioAccessTechnology,
              std::string_view cellType, std::span<const CellMonitorColumn> columns);

}  // namespace varnel
