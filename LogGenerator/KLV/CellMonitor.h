#pragma once

#include <optional>
#include <span>
#include <string_view>

#include "LogGenerator/Packet.h"
#include "platform/Dictionary.h"
#include "platform/Value.h"

namespace varnel {

/// The log code of the telephony server's cell-monitor arrays: a packet header, then a property list whose
/// root is an array of dictionaries.
inline constexpr std::uint32_t cellMonitorLogCode = 0xFF0001;

/// The records of a cell-monitor packet, as they are in the list. What is no property list, or not an array,
/// gives nothing and logs "Cell Info Array data could not be constructed".
std::optional<Value> readCellMonitorArray(const Packet& packet);

/// The record as a dictionary when it has a radio access technology and a cell type and they are the given
/// ones; else null.
const Dictionary* cellOfKind(const Value& record, std::string_view radioAccessTechnology,
                             std::string_view cellType);

/// One entry of a cell-monitor record and how a section shows it.
struct CellMonitorRow {
  std::string_view key;             ///< the record's key
  std::string_view label;           ///< the section's
  std::string_view failureMessage;  ///< logged as an error when the record has no such number
};

/// Shows each entry as a signed 32-bit decimal; an entry that is missing leaves its row as it is.
void showCellMonitorRows(Dictionary& section, const Dictionary& record, std::span<const CellMonitorRow> rows);

}  // namespace varnel
