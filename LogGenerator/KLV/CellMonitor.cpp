#include "LogGenerator/KLV/CellMonitor.h"

#include <algorithm>
#include <limits>
#include <string>

#include "base/Log.h"
#include "base/PropertyList.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr const char notConstructed[] = "Cell Info Array data could not be constructed";

std::optional<Value> parsedArray(ByteView payload) {
  auto list = readPropertyList(payload);
  return list && list->array() ? list : std::nullopt;
}

bool holdsText(const Dictionary& record, std::string_view key, std::string_view text) {
  const std::string* found = record.get(key).string();
  return found && *found == text;
}

void fill(Dictionary& record, const Dictionary& cell, std::span<const CellMonitorColumn> columns) {
  using Width = CellMonitorColumn::Width;
  for (const CellMonitorColumn& column : columns) {
    const auto number = cell.get(column.key).int32();
    if (!number) {
      logError("%s", column.failureMessage);
    } else if (column.width == Width::Unsigned16) {
      setInteger(record, column.label, column.format, static_cast<std::uint16_t>(*number));
    } else if (static_cast<std::int16_t>(*number) == std::numeric_limits<std::int16_t>::max()) {
      record.setText(column.label, "");
    } else {
      setInteger(record, column.label, column.format, static_cast<std::int16_t>(*number));
    }
  }
}

}  // namespace

std::optional<Value> readCellMonitorArray(const Packet& packet) {
  auto records = parsedArray(packet.payload());
  if (!records) logError(notConstructed);
  return records;
}

const Array* CellMonitorReader::parse(const Packet& packet) {
  const ByteView payload = packet.payload();
  if (!_payload || !std::ranges::equal(payload, *_payload)) {
    if (!_payload) _payload.emplace();
    _payload->assign(payload.begin(), payload.end());
    _records.reset();  // frees the memory for the new one
    _records = parsedArray(payload);
  }
  if (_records) return _records->array();
  logError(notConstructed);
  return nullptr;
}

const Array* CellMonitorReader::read(const Packet& packet) {
  const Array* const cells = parse(packet);
  if (!cells) logError("Failed to get Cell Array\n");
  return cells;
}

const Dictionary* cellOfKind(const Value& record, std::string_view radioAccessTechnology,
                             std::string_view cellType) {
  const Dictionary* entries = record.dictionary();
  const bool matches = entries &&
                       holdsText(*entries, cellMonitor::radioAccessTechnology, radioAccessTechnology) &&
                       holdsText(*entries, cellMonitor::cellType, cellType);
  return matches ? entries : nullptr;
}

const Dictionary* firstCellOfKind(const Array& records, std::string_view radioAccessTechnology,
                                  std::string_view cellType) {
  for (const Value& record : records) {
    if (const Dictionary* cell = cellOfKind(record, radioAccessTechnology, cellType)) return cell;
  }
  return nullptr;
}

void showCell(Section& section, const Dictionary& cell, std::span<const CellMonitorEntry> entries) {
  for (const CellMonitorEntry& entry : entries) {
    if (const auto number = cell.get(entry.key).int32()) {
      section.setText(entry.label, std::to_string(*number));
    } else {
      logError("%s", entry.failureMessage);
    }
  }
}

void addCells(Array& list, const Array& cells, std::string_view radioAccessTechnology,
              std::string_view cellType, std::span<const CellMonitorColumn> columns) {
  for (const Value& candidate : cells) {
    const Dictionary* cell = cellOfKind(candidate, radioAccessTechnology, cellType);
    if (!cell) continue;
    const Value& record = list.emplace_back(Value::ofDictionary());
    record.dictionary()->reserve(columns.size());
    fill(*record.dictionary(), *cell, columns);
  }
}

}  // namespace varnel
